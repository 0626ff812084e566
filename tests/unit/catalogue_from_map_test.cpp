#include "location/catalogue_from_map.h"

#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "test_support.h"

TEST(CatalogueFromMap, DerivesTheFolderBeforeTheFirstMod) {
    const std::string tail = "mods\\std\\com\\maddox\\il2\\objects\\";
    EXPECT_EQ(DeriveCatalogueFolderFromMap("D:\\Sim\\MODS\\MapMods\\maps\\Fields\\*actors.static"),
              "D:\\Sim\\" + tail);
    EXPECT_EQ(DeriveCatalogueFolderFromMap("D:\\Modding\\Sim\\MODS\\MapMods\\maps\\A\\*a"), "D:\\" + tail);
    EXPECT_EQ(DeriveCatalogueFolderFromMap("D:\\Sim\\Maps\\Fields\\*actors.static"), tail);
    EXPECT_EQ(DeriveCatalogueFolderFromMap("mods\\maps\\*actors.static"), tail);
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
    std::string selection = Folder("Modding/Sim/Mods/MapMods/maps/Fields") + "*actors.static";
    HeadlessScript(BrowserStep("Searching static.ini", chosen, "static.ini", true));
    HeadlessScript(ControlStep("Searching static.ini", 2));
    EXPECT_EQ(LocateCatalogueFromMapFile(selection), chosen);
    EXPECT_EQ(CatalogueFolder, chosen);
    EXPECT_EQ(Messages(), Strings({"static.ini not found: Select static.ini manuelly"}));
    // Closing the chooser leaves no folder known.
    EXPECT_EQ(LocateCatalogueFromMapFile(selection), "");
    EXPECT_EQ(CatalogueFolder, "");
}
