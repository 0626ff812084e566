#include "shell/startup.h"

#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "shell/main_window.h"
#include "test_support.h"

namespace {

const std::string Main = "Verrant V.1.3";
const std::string Chooser = "Searching static.ini";
const std::string Question =
    "Path to static.ini: Select path to static.ini (..\\mods\\STD\\com\\..\\objects) first";

class StartupTest : public ScratchTest {
   protected:
    void SetUp() override {
        ScratchTest::SetUp();
        Write("start/readme.txt", "");
        Write("Sim/MODS/STD/com/maddox/il2/objects/static.ini", "[buildings.House$A]\r\n");
        catalogue = Folder("Sim/MODS/STD/com/maddox/il2/objects");
        MakeFolderCurrent(Folder("start"));
    }
    void ScriptChoosingTheCatalogue() {
        HeadlessScript(BrowserStep(Chooser, catalogue, "", false));
        HeadlessScript(ChooserOkStep());
    }
    bool AnyWindowOpen() const {
        for (const std::string& title : HeadlessWindowTitlesOpened())
            if (HeadlessFindWindow(title) != 0) return true;
        return false;
    }
    std::string catalogue;
};

}  // namespace

TEST_F(StartupTest, FirstStartSavesTheChosenFolder) {
    ScriptChoosingTheCatalogue();
    EXPECT_EQ(RunVerrant(), 0);
    EXPECT_EQ(Messages(), Strings({Question, "Path saved: Path saved in verrant.ini"}));
    EXPECT_EQ(Read("start/verrant.ini"), catalogue);
    EXPECT_EQ(CatalogueFolder, catalogue);
    EXPECT_EQ(MapsPattern, Folder("Sim") + "Mods\\mapmods\\maps\\*.*");
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({Main, Chooser}));
    EXPECT_EQ(HeadlessWaitsRunDry(), 1);
}

TEST_F(StartupTest, FirstStartWithTheChooserClosedAsksAgainAtTheFirstCommand) {
    HeadlessScript(CloseStep(Chooser));
    HeadlessScript(MenuStep(Main, MenuDoubledObjects));
    EXPECT_EQ(RunVerrant(), 0);
    EXPECT_EQ(Messages(), Strings({Question}));
    EXPECT_FALSE(Exists("start/verrant.ini"));
    EXPECT_EQ(CatalogueFolder, "");
    EXPECT_EQ(MapsPattern, "");
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({Main, Chooser, Chooser}));
}

TEST_F(StartupTest, FolderThatCannotBeSavedServesThisRun) {
    HeadlessFileFaults faults;
    faults.failCreate = "verrant.ini";
    HeadlessSetFileFaults(faults);
    ScriptChoosingTheCatalogue();
    EXPECT_EQ(RunVerrant(), 0);
    EXPECT_EQ(Messages(),
              Strings({Question, "Path not saved: Can't write verrant.ini in " + Folder("start")}));
    EXPECT_FALSE(Exists("start/verrant.ini"));
    EXPECT_EQ(CatalogueFolder, catalogue);
    EXPECT_EQ(MapsPattern, Folder("Sim") + "Mods\\mapmods\\maps\\*.*");
}

TEST_F(StartupTest, LostFolderIsToldWithoutAQuestion) {
    Write("start/verrant.ini", Folder("Sim/gone"));
    EXPECT_EQ(RunVerrant(), 0);
    EXPECT_EQ(Messages(), Strings({"static,ini failure: static.ini not found in " + Folder("Sim/gone")}));
    EXPECT_FALSE(Exists("start/verrant.ini"));
    EXPECT_EQ(CatalogueFolder, "");
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({Main}));
}

TEST_F(StartupTest, ShutdownClosesTheProgressListToo) {
    Write("start/verrant.ini", catalogue);
    HeadlessScript(ControlStep(Main, ProgressToggleId));
    HeadlessScript(MenuStep(Main, MenuClose));
    EXPECT_EQ(RunVerrant(), 0);
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({Main, "List searching window"}));
    EXPECT_FALSE(AnyWindowOpen());
}

TEST_F(StartupTest, WindowThatCannotBeMadeEndsTheProgramWithAMessage) {
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

TEST_F(StartupTest, StartFolderEndsInOneBackslash) {
    MakeFolderCurrent("\\");
    HeadlessScript(CloseStep(Chooser));
    EXPECT_EQ(RunVerrant(), 0);
    EXPECT_EQ(StartFolder, "\\");
}
