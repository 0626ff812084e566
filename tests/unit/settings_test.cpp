#include "location/settings.h"

#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "test_support.h"

namespace {

class SettingsTest : public ScratchTest {
   protected:
    void SetUp() override {
        ScratchTest::SetUp();
        Write("start/readme.txt", "");
        StartFolder = Folder("start");
        catalogue = Folder("Sim/MODS/STD/com/maddox/il2/objects");
        Write("Sim/MODS/STD/com/maddox/il2/objects/static.ini", "[***]\r\n");
    }
    // The maps pattern the catalogue folder above gives: the path's own "M", the rest as written.
    std::string CatalogueMapsPattern() const { return Folder("Sim") + "Mods\\mapmods\\maps\\*.*"; }
    std::string Current() const { return CurrentFolder() + "\\"; }

    std::string catalogue;
};

}  // namespace

TEST_F(SettingsTest, OnlyTheFirstLineNamesTheFolder) {
    const Strings rests = {
        "", "\r\nD:\\other\\", "\nD:\\other\\", "\rD:\\other\\", std::string("\0tail", 5), "\r\n"};
    for (const std::string& rest : rests) {
        SCOPED_TRACE(rest);
        HeadlessReset();
        CatalogueFolder = MapsPattern = "";
        Write("start/verrant.ini", catalogue + rest);
        EXPECT_FALSE(LoadSettings(StartFolder));
        EXPECT_EQ(CatalogueFolder, catalogue);
        EXPECT_EQ(MapsPattern, CatalogueMapsPattern());
        EXPECT_EQ(Current(), catalogue);
        EXPECT_EQ(Read("start/verrant.ini"), catalogue + rest);
        EXPECT_EQ(Messages(), Strings{});
    }
}

TEST_F(SettingsTest, NoSettingsFileLeavesTheStateAsItWas) {
    CatalogueFolder = "D:\\kept\\";
    MapsPattern = "D:\\mods\\mapmods\\maps\\*.*";
    EXPECT_TRUE(LoadSettings(StartFolder));
    EXPECT_EQ(CatalogueFolder, "D:\\kept\\");
    EXPECT_EQ(MapsPattern, "D:\\mods\\mapmods\\maps\\*.*");
    EXPECT_EQ(Messages(), Strings{});
    EXPECT_TRUE(LoadSettings(Folder("no such start")));
}

// A lost folder is told, forgotten and dropped from the settings file, and no question follows.
TEST_F(SettingsTest, FolderWithoutCatalogueIsForgotten) {
    struct Case {
        std::string name, firstLine;
        bool startHoldsCatalogue;
    };
    const std::vector<Case> cases = {
        {"emptied folder", Folder("Sim/emptied"), false},
        {"deleted folder", Folder("Sim/gone"), false},
        {"deleted folder, catalogue in the start folder", Folder("Sim/gone"), true},
        {"empty first line", "", false},
        {"empty first line, catalogue in the start folder", "", true},
    };
    Write("Sim/emptied/readme.txt", "");
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        HeadlessReset();
        CatalogueFolder = MapsPattern = "";
        Write("start/verrant.ini", c.firstLine + "\r\nsecond line");
        if (c.startHoldsCatalogue) Write("start/static.ini", "[***]\r\n");
        EXPECT_FALSE(LoadSettings(StartFolder));
        EXPECT_EQ(Messages(), Strings({"static,ini failure: static.ini not found in " + c.firstLine}));
        EXPECT_EQ(CatalogueFolder, "");
        EXPECT_EQ(MapsPattern, "");
        EXPECT_FALSE(Exists("start/verrant.ini"));
        EXPECT_TRUE(Exists("start/readme.txt"));
        EXPECT_EQ(Current(), StartFolder);
    }
}

TEST_F(SettingsTest, SavedFileIsTheFolderWithoutLineEnd) {
    Write("start/verrant.ini", "D:\\a much longer folder path than the new one\\\r\nmore\r\n");
    CatalogueFolder = "D:\\known\\";
    MapsPattern = "D:\\mods\\mapmods\\maps\\*.*";
    MakeFolderCurrent(catalogue);
    EXPECT_TRUE(SavePath(catalogue, StartFolder));
    EXPECT_EQ(Read("start/verrant.ini"), catalogue);
    EXPECT_FALSE(Exists("Sim/MODS/STD/com/maddox/il2/objects/verrant.ini"));
    EXPECT_EQ(Messages(), Strings({"Path saved: Path saved in verrant.ini"}));
    EXPECT_EQ(CatalogueFolder, "D:\\known\\");
    EXPECT_EQ(MapsPattern, "D:\\mods\\mapmods\\maps\\*.*");

    LoadSettings(StartFolder);
    EXPECT_EQ(CatalogueFolder, catalogue);
}

TEST_F(SettingsTest, UnwritableSettingsFileIsNotCalledSaved) {
    struct Case {
        std::string name;
        HeadlessFileFaults faults;
        std::string startFolder;
        std::string leftBehind;  // what verrant.ini in the start folder holds afterwards; "" for none
    };
    HeadlessFileFaults cannotCreate, cannotWrite;
    cannotCreate.failCreate = "verrant.ini";
    cannotWrite.failWriteName = "verrant.ini";
    cannotWrite.failWriteAfterBytes = 4;
    const std::vector<Case> cases = {
        {"cannot create", cannotCreate, Folder("start"), "old"},
        {"write cut off", cannotWrite, Folder("start"), ""},
        {"start folder gone", HeadlessFileFaults(), Folder("gone"), "old"},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        HeadlessReset();
        Write("start/verrant.ini", "old");
        HeadlessSetFileFaults(c.faults);
        MakeFolderCurrent(catalogue);
        EXPECT_FALSE(SavePath(catalogue, c.startFolder));
        EXPECT_EQ(Messages(), Strings({"Path not saved: Can't write verrant.ini in " + c.startFolder}));
        EXPECT_EQ(Exists("start/verrant.ini"), !c.leftBehind.empty());
        EXPECT_EQ(Read("start/verrant.ini"), c.leftBehind);
        EXPECT_FALSE(Exists("Sim/MODS/STD/com/maddox/il2/objects/verrant.ini"));
    }
}

TEST_F(SettingsTest, ClearTwiceDeletesThenHasNothingToClear) {
    Write("start/verrant.ini", catalogue);
    LoadSettings(StartFolder);
    // The catalogue folder is current now; a file of the same name there is not the settings file.
    Write("Sim/MODS/STD/com/maddox/il2/objects/verrant.ini", "decoy");
    ClearPath();
    EXPECT_FALSE(Exists("start/verrant.ini"));
    EXPECT_TRUE(Exists("Sim/MODS/STD/com/maddox/il2/objects/verrant.ini"));
    EXPECT_EQ(CatalogueFolder, "");
    EXPECT_EQ(MapsPattern, "");
    ClearPath();
    EXPECT_EQ(Messages(),
              Strings({"Path cleared: verrant.ini deleted", "Path cleared failure: Nothing to clear"}));
}

