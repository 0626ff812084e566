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

// Every menu item and button reaches its own command, asking for the folder first while none is known.
TEST_F(EventLoopTest, CommandsThatNeedTheFolderAskForIt) {
    const struct {
        int id;
        Strings messages;
        std::string output;  // what the command leaves on the desktop
    } cases[] = {
        {MenuDoubledObjects, {}, "Doubled_objects.txt"},
        {MenuSavePath, {"Path saved: Path saved in verrant.ini"}, ""},
        {MenuIrregularEntries, {"No irregular objects: No irregular objects found in your static.ini"}, ""},
        {MenuEmptyReferences, {}, "Empty_references.txt"},
        {MenuWrongSimReferences, {}, "Missing_3do.txt"},
        {MenuDoubledUsedSims, {}, "Doubled_sims_or_meshes.txt"},
        {MenuListForFmb, {}, "Static_list_FMB.txt"},
        {MenuListForFmbPlus, {}, "Static_list_FMBplus.txt"},
        {MenuRenumber, {"Renumber static.ini: Done"}, ""},
        {MenuDenumber, {"Denumber static.ini: Done"}, ""},
        {OpenCatalogueButtonId, {}, ""},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.id);
        Restart();
        HeadlessStep command = c.id == OpenCatalogueButtonId ? ControlStep(Main, c.id) : MenuStep(Main, c.id);
        HeadlessScript(command);
        HeadlessScript(CloseStep(Chooser));
        HeadlessScript(Look([&] {
            EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({Main, Chooser}));
            EXPECT_EQ(Messages(), Strings{});
            EXPECT_TRUE(HeadlessProcesses().empty());
            EXPECT_EQ(CatalogueFolder, "");
        }));
        HeadlessScript(command);
        HeadlessScript(BrowserStep(Chooser, catalogue, "static.ini", true));
        HeadlessScript(ChooserOkStep());
        RunMainEventLoop();
        EXPECT_EQ(CatalogueFolder, catalogue);
        EXPECT_EQ(Messages(), c.messages);
        EXPECT_TRUE(c.output.empty() || Exists("Desktop/" + c.output));
        EXPECT_EQ(Exists("start/verrant.ini"), c.id == MenuSavePath);
        // Reports open in the viewer; Open static.ini opens the catalogue in its own folder.
        EXPECT_EQ(HeadlessProcesses().size(), c.messages.empty() ? 1u : 0u);
        if (c.id == OpenCatalogueButtonId) {
            EXPECT_EQ(HeadlessProcesses()[0].workingFolder, catalogue);
        }
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
