// The settings file and the start-up that reads it: one line, the catalogue folder, no line end.
#include "location/settings.h"

#include "output/app_state.h"
#include "shell/main_window.h"
#include "shell/startup.h"
#include "test_support.h"

namespace {

const std::string Main = "Verrant V.1.3", Chooser = "Searching static.ini";
const std::string Question = "Path to static.ini: Select path to static.ini (..\\mods\\STD\\com\\..\\objects) first";

class SettingsTest : public ScratchTest {
protected:
    void SetUp() override {
        ScratchTest::SetUp();
        Write("start/readme.txt", "");
        StartFolder = Folder("start");
        MakeFolderCurrent(StartFolder);
        catalogue = Folder("Sim/MODS/STD/com/maddox/il2/objects");
        Write("Sim/MODS/STD/com/maddox/il2/objects/static.ini", "[buildings.House$A]\r\n");
    }
    // The maps pattern of the catalogue folder: the path's own "M", the rest as written.
    std::string MapsOfCatalogue() const { return Folder("Sim") + "Mods\\mapmods\\maps\\*.*"; }
    void ScriptChoosing(const std::string& folder) {
        HeadlessScript(BrowserStep(Chooser, folder, "", false));
        HeadlessScript(ChooserOkStep());
    }
    std::string catalogue;
};

}  // namespace

TEST_F(SettingsTest, OnlyTheFirstLineNamesTheFolder) {
    for (const std::string rest : {"", "\r\nD:\\other\\", "\nD:\\x\\", "\rD:\\x\\", "\r\n"}) {
        SCOPED_TRACE(rest);
        CatalogueFolder = MapsPattern = "";
        Write("start/verrant.ini", catalogue + rest);
        EXPECT_FALSE(LoadSettings(StartFolder));
        EXPECT_EQ(CatalogueFolder, catalogue);
        EXPECT_EQ(MapsPattern, MapsOfCatalogue());
        EXPECT_EQ(Messages(), Strings{});
    }
    std::remove(Host("start/verrant.ini").c_str());
    EXPECT_TRUE(LoadSettings(StartFolder)) << "no settings file: the state stays";
    EXPECT_EQ(CatalogueFolder, catalogue);
}

// A lost folder is told, forgotten and dropped from the settings file, even when the start folder
// holds a catalogue of its own.
TEST_F(SettingsTest, FolderWithoutCatalogueIsForgotten) {
    Write("Sim/emptied/readme.txt", "");
    for (const std::string& firstLine : {Folder("Sim/emptied"), Folder("Sim/gone"), std::string()}) {
        SCOPED_TRACE(firstLine);
        HeadlessReset();
        Write("start/verrant.ini", firstLine + "\r\nsecond line");
        Write("start/static.ini", "[***]\r\n");
        EXPECT_FALSE(LoadSettings(StartFolder));
        EXPECT_EQ(Messages(), Strings({"static,ini failure: static.ini not found in " + firstLine}));
        EXPECT_EQ(CatalogueFolder + MapsPattern, "");
        EXPECT_FALSE(Exists("start/verrant.ini"));
        EXPECT_TRUE(Exists("start/readme.txt"));
    }
}

TEST_F(SettingsTest, SavingWritesTheFolderWithoutLineEndOrSaysItCannot) {
    HeadlessFileFaults cannotCreate, cannotWrite;
    cannotCreate.failCreate = cannotWrite.failWriteName = "verrant.ini";
    cannotWrite.failWriteAfterBytes = 4;
    const struct {
        HeadlessFileFaults faults;
        std::string startFolder, message, left;  // left: what verrant.ini holds afterwards
    } cases[] = {
        {{}, Folder("start"), "Path saved: Path saved in verrant.ini", catalogue},
        {cannotCreate, Folder("start"), "Path not saved: Can't write verrant.ini in " + Folder("start"), "old\r\nmore"},
        {cannotWrite, Folder("start"), "Path not saved: Can't write verrant.ini in " + Folder("start"), ""},
        {{}, Folder("gone"), "Path not saved: Can't write verrant.ini in " + Folder("gone"), "old\r\nmore"},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.message);
        HeadlessReset();
        Write("start/verrant.ini", "old\r\nmore");
        HeadlessSetFileFaults(c.faults);
        MakeFolderCurrent(catalogue);
        EXPECT_EQ(SavePath(catalogue, c.startFolder), c.left == catalogue);
        EXPECT_EQ(Messages(), Strings{c.message});
        EXPECT_EQ(Read("start/verrant.ini"), c.left);
        EXPECT_FALSE(Exists("Sim/MODS/STD/com/maddox/il2/objects/verrant.ini"));
    }
}

TEST_F(SettingsTest, ClearTwiceDeletesThenHasNothingToClear) {
    Write("start/verrant.ini", catalogue);
    LoadSettings(StartFolder);
    // The catalogue folder is current now; a file of the same name there is not the settings file.
    Write("Sim/MODS/STD/com/maddox/il2/objects/verrant.ini", "decoy");
    ClearPath();
    ClearPath();
    EXPECT_EQ(Messages(), Strings({"Path cleared: verrant.ini deleted", "Path cleared failure: Nothing to clear"}));
    EXPECT_TRUE(Exists("Sim/MODS/STD/com/maddox/il2/objects/verrant.ini"));
    EXPECT_EQ(CatalogueFolder + MapsPattern, "");
}

TEST_F(SettingsTest, FirstStartAsksAndSavesTheChosenFolder) {
    ScriptChoosing(Folder("Sim"));  // no static.ini there: the chooser stays open
    ScriptChoosing(catalogue);
    EXPECT_EQ(RunVerrant(), 0);
    EXPECT_EQ(Messages(), Strings({Question, "Wrong folder selected: There is no 'static.ini'",
                                   "Path saved: Path saved in verrant.ini"}));
    EXPECT_EQ(Read("start/verrant.ini"), catalogue);
    EXPECT_EQ(MapsPattern, MapsOfCatalogue());
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({Main, Chooser}));
}

TEST_F(SettingsTest, FolderThatCannotBeSavedServesThisRun) {
    HeadlessFileFaults faults;
    faults.failCreate = "verrant.ini";
    HeadlessSetFileFaults(faults);
    ScriptChoosing(catalogue);
    EXPECT_EQ(RunVerrant(), 0);
    EXPECT_EQ(Messages(), Strings({Question, "Path not saved: Can't write verrant.ini in " + Folder("start")}));
    EXPECT_EQ(CatalogueFolder, catalogue);
    EXPECT_EQ(MapsPattern, MapsOfCatalogue());
}

TEST_F(SettingsTest, ChooserClosedAtStartAsksAgainAtTheFirstCommand) {
    MakeFolderCurrent("\\");  // a start folder that is a root ends in one backslash
    HeadlessScript(CloseStep(Chooser));
    HeadlessScript(ControlStep(Main, ProgressToggleId));
    HeadlessScript(MenuStep(Main, MenuDoubledObjects));
    EXPECT_EQ(RunVerrant(), 0);
    EXPECT_EQ(StartFolder, "\\");
    EXPECT_EQ(Messages(), Strings({Question}));
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({Main, Chooser, "List searching window", Chooser}));
    for (const std::string& title : HeadlessWindowTitlesOpened()) EXPECT_EQ(HeadlessFindWindow(title), 0u);
}

TEST_F(SettingsTest, LostFolderAtStartIsToldWithoutAQuestion) {
    Write("start/verrant.ini", Folder("Sim/gone"));
    EXPECT_EQ(RunVerrant(), 0);
    EXPECT_EQ(Messages(), Strings({"static,ini failure: static.ini not found in " + Folder("Sim/gone")}));
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({Main}));
}

TEST_F(SettingsTest, WindowThatCannotBeMadeEndsTheProgramWithAMessage) {
    for (const std::string& title : {Main, Chooser}) {
        auto start = [&title] {
            HeadlessEcho(false, true);
            HeadlessSetWindowFails(title);
            RunVerrant();
            std::exit(0);
        };
        EXPECT_EXIT(start(), ::testing::ExitedWithCode(2), "Window failure: Can't open the window " + title);
    }
}
