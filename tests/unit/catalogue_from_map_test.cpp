#include "location/catalogue_from_map.h"

#include "platform/headless/headless.h"
#include "shell/app_state.h"
#include "test_support.h"

TEST(CatalogueFromMap, DerivesTheFolderBeforeTheFirstMod) {
    struct Case {
        std::string selection, folder;
    };
    const Case cases[] = {
        {"D:\\Sim\\MODS\\MapMods\\maps\\Fields\\*actors.static",
         "D:\\Sim\\mods\\std\\com\\maddox\\il2\\objects\\"},
        {"D:\\Sim\\mods\\mapmods\\maps\\Fields\\*", "D:\\Sim\\mods\\std\\com\\maddox\\il2\\objects\\"},
        {"D:\\Modding\\Sim\\MODS\\MapMods\\maps\\A\\*actors.static",
         "D:\\mods\\std\\com\\maddox\\il2\\objects\\"},
        {"D:\\Sim\\Maps\\Fields\\*actors.static", "mods\\std\\com\\maddox\\il2\\objects\\"},
        {"mods\\maps\\*actors.static", "mods\\std\\com\\maddox\\il2\\objects\\"},
        {"", "mods\\std\\com\\maddox\\il2\\objects\\"},
    };
    for (const Case& c : cases) EXPECT_EQ(DeriveCatalogueFolderFromMap(c.selection), c.folder) << c.selection;
}

class CatalogueFromMapTest : public ScratchTest {
protected:
    void SetUp() override {
        ScratchTest::SetUp();
        ASSERT_EQ(root.find("mod"), std::string::npos) << "the tree must be the first \"mod\" in its paths";
    }
};

TEST_F(CatalogueFromMapTest, FolderBelowTheTreeIsTakenWithoutAWord) {
    Write("Sim/Mods/std/com/maddox/il2/objects/static.ini", "");
    std::string found = LocateCatalogueFromMapFile(Folder("Sim/Mods/MapMods/maps/Fields") + "*actors.static");
    EXPECT_EQ(found, Folder("Sim") + "mods\\std\\com\\maddox\\il2\\objects\\");
    EXPECT_EQ(CatalogueFolder, found);
    EXPECT_EQ(Messages(), Strings{});
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings{});
}

TEST_F(CatalogueFromMapTest, WrongCutAboveTheTreeLeadsToTheChooser) {
    Write("Modding/Sim/Mods/std/com/maddox/il2/objects/static.ini", "");
    std::string chosen = Folder("Modding/Sim/Mods/std/com/maddox/il2/objects");
    HeadlessScript(BrowserStep("Searching static.ini", chosen, "static.ini", true));
    HeadlessScript(ControlStep("Searching static.ini", 2));
    std::string found = LocateCatalogueFromMapFile(Folder("Modding/Sim/Mods/MapMods/maps/Fields") + "*a");
    EXPECT_EQ(Messages(), Strings({"static.ini not found: Select static.ini manuelly"}));
    EXPECT_EQ(found, chosen);
    EXPECT_EQ(CatalogueFolder, chosen);
}

TEST_F(CatalogueFromMapTest, ClosedChooserLeavesNoFolder) {
    CatalogueFolder = Folder("earlier");
    EXPECT_EQ(LocateCatalogueFromMapFile(Folder("Sim/Mods/MapMods/maps/Fields") + "*actors.static"), "");
    EXPECT_EQ(CatalogueFolder, "");
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({"Searching static.ini"}));
}
