#include "shell/event_loop.h"

#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "shell/main_window.h"
#include "test_support.h"

#include <filesystem>
#include <functional>

namespace {

const std::string Main = "Verrant V.1.3";
const std::string ProgressTitle = "List searching window";
const std::string Chooser = "Searching static.ini";
const std::string TwoAs = "[buildings.House$A]\r\n[buildings.House$A]\r\n";

HeadlessStep ToggleClick() { return ControlStep(Main, ProgressToggleId); }

// The pending steps arrive while the command of the step runs, as clicks made during it would.
HeadlessStep WhileRunning(std::vector<HeadlessStep> pending, HeadlessStep step) {
    return [=] {
        for (const HeadlessStep& each : pending) HeadlessPushPending(each);
        return step();
    };
}

// Runs the check between two events, when the command before it has ended.
HeadlessStep Look(std::function<void()> check) {
    return [=] {
        check();
        return OtherStep(Main)();
    };
}

class EventLoopTest : public ScratchTest {
   protected:
    void SetUp() override {
        ScratchTest::SetUp();
        Write("start/readme.txt", "");
        StartFolder = Folder("start");
        OpenMainWindow();
        catalogue = Folder("Sim/mods/STD/com/maddox/il2/objects");
        Write("Sim/mods/STD/com/maddox/il2/objects/static.ini", TwoAs);
    }
    void Restart() {
        std::filesystem::remove(Host("start/verrant.ini"));
        HeadlessReset();
        ClearAppState();
        StartFolder = Folder("start");
        HeadlessSetDesktopFolder(Folder("Desktop"));
        OpenMainWindow();
    }
    std::string catalogue;
};

}  // namespace

TEST_F(EventLoopTest, CloseRequestFromAnyWindowEndsTheLoop) {
    struct Case {
        std::string name;
        std::vector<HeadlessStep> steps;
    };
    const std::vector<Case> cases = {
        {"close box", {CloseStep(Main)}},
        {"Close item", {MenuStep(Main, MenuClose)}},
        {"progress list window", {ToggleClick(), CloseStep(ProgressTitle)}},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        Restart();
        for (const HeadlessStep& step : c.steps) HeadlessScript(step);
        HeadlessScript(MenuStep(Main, MenuClearPath));
        RunMainEventLoop();
        EXPECT_EQ(HeadlessWaitsRunDry(), 0);
        EXPECT_EQ(Messages(), Strings{});
    }
}

TEST_F(EventLoopTest, EventsOfOtherWindowsDoNothing) {
    HeadlessScript(ToggleClick());
    HeadlessScript(MenuStep(ProgressTitle, MenuClearPath));
    HeadlessScript(MenuStep(ProgressTitle, MenuDoubledObjects));
    HeadlessScript(MenuStep(ProgressTitle, MenuClose));
    HeadlessScript(ControlStep(ProgressTitle, OpenCatalogueButtonId));
    HeadlessScript(ControlStep(ProgressTitle, ProgressToggleId));
    HeadlessScript(OtherStep(Main));
    RunMainEventLoop();
    EXPECT_EQ(HeadlessWaitsRunDry(), 1);
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({Main, ProgressTitle}));
    EXPECT_EQ(Messages(), Strings{});
    EXPECT_TRUE(ProgressListOn);
    EXPECT_TRUE(IsWindowOpen(ProgressWindow));
}

TEST_F(EventLoopTest, ToggleOnOffOnGivesANewEmptyList) {
    CatalogueFolder = catalogue;
    Handle first = 0;
    HeadlessScript(ToggleClick());
    HeadlessScript(MenuStep(Main, MenuDoubledObjects));
    HeadlessScript(Look([&] {
        first = ProgressWindow;
        EXPECT_TRUE(ProgressListOn);
        EXPECT_FALSE(ProgressLines().empty());
    }));
    HeadlessScript(ToggleClick());
    HeadlessScript(Look([&] {
        EXPECT_FALSE(ProgressListOn);
        EXPECT_FALSE(IsWindowOpen(first));
        EXPECT_EQ(ProgressWindow, 0u);
    }));
    HeadlessScript(ToggleClick());
    HeadlessScript(CloseStep(Main));
    RunMainEventLoop();
    EXPECT_TRUE(ProgressListOn);
    EXPECT_TRUE(IsWindowOpen(ProgressWindow));
    EXPECT_NE(ProgressWindow, first);
    EXPECT_EQ(ProgressLines(), Strings{});
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({Main, ProgressTitle, ProgressTitle}));
}

// A click dropped during a check redraws the toggle only; the next click the loop sees takes the
// toggle's state as it is then.
TEST_F(EventLoopTest, ToggleStateIsTakenAtTheNextClickTheLoopSees) {
    CatalogueFolder = catalogue;
    HeadlessScript(WhileRunning({ToggleClick()}, MenuStep(Main, MenuDoubledObjects)));
    HeadlessScript(Look([] {
        EXPECT_TRUE(IsToggleDown(ProgressToggle));
        EXPECT_FALSE(ProgressListOn);
        EXPECT_EQ(ProgressWindow, 0u);
    }));
    HeadlessScript(ToggleClick());
    HeadlessScript(Look([] {
        EXPECT_FALSE(IsToggleDown(ProgressToggle));
        EXPECT_FALSE(ProgressListOn);
        EXPECT_EQ(ProgressWindow, 0u);
    }));

    Handle opened = 0;
    HeadlessScript(ToggleClick());
    HeadlessScript(WhileRunning({ToggleClick()}, MenuStep(Main, MenuDoubledObjects)));
    HeadlessScript(Look([&] {
        opened = ProgressWindow;
        EXPECT_FALSE(IsToggleDown(ProgressToggle));
        EXPECT_TRUE(ProgressListOn);
        EXPECT_TRUE(IsWindowOpen(ProgressWindow));
    }));
    HeadlessScript(ToggleClick());
    HeadlessScript(CloseStep(Main));
    RunMainEventLoop();
    EXPECT_TRUE(IsToggleDown(ProgressToggle));
    EXPECT_TRUE(ProgressListOn);
    EXPECT_EQ(ProgressWindow, opened);
    EXPECT_FALSE(ProgressLines().empty());
}

TEST_F(EventLoopTest, EventsPendingDuringACommandAreDropped) {
    CatalogueFolder = catalogue;
    Write("start/verrant.ini", catalogue);
    HeadlessScript(WhileRunning({MenuStep(Main, MenuClearPath), ControlStep(Main, OpenCatalogueButtonId),
                                 ToggleClick(), CloseStep(Main)},
                                MenuStep(Main, MenuDoubledObjects)));
    HeadlessScript(Look([&] {
        EXPECT_TRUE(Exists("start/verrant.ini"));
        EXPECT_EQ(Messages(), Strings{});
        EXPECT_EQ(HeadlessProcesses().size(), 1u);
        EXPECT_FALSE(ProgressListOn);
    }));
    HeadlessScript(MenuStep(Main, MenuClearPath));
    RunMainEventLoop();
    EXPECT_EQ(Messages(), Strings({"Path cleared: verrant.ini deleted"}));
    EXPECT_EQ(HeadlessWaitsRunDry(), 1);
}

TEST_F(EventLoopTest, CommandsThatNeedTheFolderAskForIt) {
    struct Case {
        std::string name;
        HeadlessStep command;
        std::function<void()> expectDone;  // after the chooser gave the folder
    };
    const std::vector<Case> cases = {
        {".. doubled objects", MenuStep(Main, MenuDoubledObjects),
         [&] { EXPECT_FALSE(Desktop("Doubled_objects.txt").empty()); }},
        {"Save path", MenuStep(Main, MenuSavePath),
         [&] {
             EXPECT_EQ(Read("start/verrant.ini"), catalogue);
             EXPECT_EQ(Messages(), Strings({"Path saved: Path saved in verrant.ini"}));
         }},
        {".. irregular entrys", MenuStep(Main, MenuIrregularEntries),
         [&] {
             EXPECT_EQ(Messages(),
                       Strings({"No irregular objects: No irregular objects found in your static.ini"}));
         }},
        {".. empty references", MenuStep(Main, MenuEmptyReferences),
         [&] { EXPECT_FALSE(Desktop("Empty_references.txt").empty()); }},
        {".. wrong sim references", MenuStep(Main, MenuWrongSimReferences),
         [&] { EXPECT_NE(Desktop("Missing_3do.txt").find("Wrong sim references"), std::string::npos); }},
        {".. doubled used sims", MenuStep(Main, MenuDoubledUsedSims),
         [&] {
             EXPECT_NE(Desktop("Doubled_sims_or_meshes.txt").find("Doubled used sims"), std::string::npos);
         }},
        {".. objects list for FMB", MenuStep(Main, MenuListForFmb),
         [&] { EXPECT_EQ(Desktop("Static_list_FMB.txt").rfind("Object list for fmb\r\n", 0), 0u); }},
        {".. objects list for FMB+", MenuStep(Main, MenuListForFmbPlus),
         [&] { EXPECT_EQ(Desktop("Static_list_FMBplus.txt").rfind("Object list for fmb+\r\n", 0), 0u); }},
        {"Renumber static.ini", MenuStep(Main, MenuRenumber),
         [&] {
             EXPECT_EQ(Messages(), Strings({"Renumber static.ini: Done"}));
             EXPECT_EQ(Read("Sim/mods/STD/com/maddox/il2/objects/static.ini"),
                       "(0)\r\n[buildings.House$A]\r\n(1)\r\n[buildings.House$A]\r\n");
         }},
        {"Denumber static.ini", MenuStep(Main, MenuDenumber),
         [&] {
             EXPECT_EQ(Messages(), Strings({"Denumber static.ini: Done"}));
             EXPECT_EQ(Read("Sim/mods/STD/com/maddox/il2/objects/static.ini"), TwoAs);
         }},
        {"Open static.ini", ControlStep(Main, OpenCatalogueButtonId),
         [&] {
             ASSERT_EQ(HeadlessProcesses().size(), 1u);
             EXPECT_EQ(HeadlessProcesses()[0].commandLine, "\"C:\\WINDOWS\\notepad.exe\" static.ini");
             EXPECT_EQ(HeadlessProcesses()[0].workingFolder, catalogue);
         }},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.name);
        Restart();
        HeadlessSetEnvironment("WINDIR", "C:\\WINDOWS");
        HeadlessScript(c.command);
        HeadlessScript(CloseStep(Chooser));
        HeadlessScript(Look([&] {
            EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({Main, Chooser}));
            EXPECT_EQ(Messages(), Strings{});
            EXPECT_TRUE(HeadlessProcesses().empty());
            EXPECT_FALSE(Exists("start/verrant.ini"));
            EXPECT_EQ(CatalogueFolder, "");
        }));
        HeadlessScript(c.command);
        HeadlessScript(BrowserStep(Chooser, catalogue, "static.ini", true));
        HeadlessScript(ChooserOkStep());
        HeadlessScript(Look(c.expectDone));
        RunMainEventLoop();
        EXPECT_EQ(CatalogueFolder, catalogue);
        EXPECT_EQ(HeadlessWaitsRunDry(), 1);
    }
}

TEST_F(EventLoopTest, CreditItemAndUnusedIdsDoNothing) {
    Write("start/verrant.ini", catalogue);
    for (int id : {int(MenuCredit), 10, 0, 16}) HeadlessScript(MenuStep(Main, id));
    HeadlessScript(OtherStep(Main));
    RunMainEventLoop();
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({Main}));
    EXPECT_EQ(Messages(), Strings{});
    EXPECT_TRUE(HeadlessProcesses().empty());
    EXPECT_TRUE(Exists("start/verrant.ini"));
    EXPECT_EQ(HeadlessWaitsRunDry(), 1);
}

TEST_F(EventLoopTest, MissingObjectsWindowOpensWithoutAFolder) {
    HeadlessScript(MenuStep(Main, MenuMissingObjects));
    HeadlessScript(CloseStep("Searching missing objects"));
    HeadlessScript(CloseStep(Main));
    RunMainEventLoop();
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({Main, "Searching missing objects"}));
    EXPECT_EQ(CatalogueFolder, "");
    EXPECT_EQ(HeadlessWaitsRunDry(), 0);
}
