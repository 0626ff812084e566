#include "checks/doubled_objects.h"

#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "output/progress_list.h"
#include "test_support.h"

namespace {

std::string Headers(const Strings& names) {
    std::string text;
    for (const std::string& name : names) text += "[buildings.House$" + name + "]\r\nMesh 3do/x.sim\r\n";
    return text;
}

}  // namespace

TEST(DoubledObjects, PairsEachNameWithItsNextRepeat) {
    auto pairs = [](const Strings& names) {
        Strings lines;
        for (const DoubledObject& doubled : PairDoubledNames(names)) lines.push_back(DoubledObjectLine(doubled));
        return lines;
    };
    EXPECT_EQ(pairs({"A", "B", "A", "C", "B", "A"}),
              Strings({"Double object (0) => (2): A", "Double object (1) => (4): B", "Double object (2) => (5): A"}));
    EXPECT_EQ(pairs({"x", "x", "Q", "x", "y", "Q", "q", "z", "w", "x"}),
              Strings({"Double object (0) => (1): x", "Double object (1) => (3): x", "Double object (2) => (5): Q",
                       "Double object (3) => (9): x"}));
    EXPECT_EQ(pairs({"a", "A", ""}), Strings{});
    EXPECT_EQ(pairs({"", ""}), Strings({"Double object (0) => (1): "}));
}

class FindDoubledObjectsTest : public ScratchTest {};

TEST_F(FindDoubledObjectsTest, ReportIsSortedByFirstOrdinal) {
    UseCatalogue("// comment\r\n[***]\r\nTitle House\r\n" + Headers({"A", "B"}) + "[Buildings.House$A]\r\n" +
                 "[buildings.Plate$A]\r\n" + Headers({"A", "C"}) + "  [buildings.House$B] // moved\r\n" +
                 Headers({"A"}));
    EXPECT_EQ(FindDoubledObjects(), CommandResult::Findings);
    EXPECT_EQ(Desktop("Doubled_objects.txt"), CrLf({"Doubled objects in your static.ini:", "",
                                                    "Double object (0) => (3): buildings.House$A",
                                                    "Double object (1) => (5): buildings.House$B",
                                                    "Double object (3) => (6): buildings.House$A"}));
    ASSERT_EQ(HeadlessProcesses().size(), 1u);
    EXPECT_EQ(HeadlessProcesses()[0].commandLine, "\"C:\\WINDOWS\\notepad.exe\" Doubled_objects.txt");
    EXPECT_EQ(HeadlessProcesses()[0].workingFolder, Folder("Desktop"));
    EXPECT_EQ(Messages(), Strings{});
}

TEST_F(FindDoubledObjectsTest, ProgressLines) {
    UseCatalogue(Headers({"A", "B", "A"}));
    ProgressListOn = true;
    OpenProgressList();
    AddProgressLine("left over from an earlier check");
    FindDoubledObjects();
    const std::string ruler(67, '*');
    EXPECT_EQ(ProgressLines(), Strings({"Build (0) buildings.House$A", ruler,
                                        "Double object (0) => (2): buildings.House$A", ruler,
                                        "Build (1) buildings.House$B", "Build (2) buildings.House$A", "",
                                        "Total number of objects: 3"}));
}

TEST_F(FindDoubledObjectsTest, NoDoublesShowsMessageAndWritesNoReport) {
    UseCatalogue(Headers({"A", "a", "B"}));
    ProgressListOn = true;
    OpenProgressList();
    EXPECT_EQ(FindDoubledObjects(), CommandResult::NothingFound);
    EXPECT_EQ(Messages(), Strings({"No doubled objects: No doubled objects found in your static.ini"}));
    EXPECT_FALSE(Exists("Desktop/Doubled_objects.txt"));
    EXPECT_TRUE(HeadlessProcesses().empty());
    EXPECT_EQ(ProgressLines().back(), "Total number of objects: 3");
}

TEST_F(FindDoubledObjectsTest, EmptyCatalogueCountsNoObjects) {
    UseCatalogue("");
    ProgressListOn = true;
    OpenProgressList();
    EXPECT_EQ(FindDoubledObjects(), CommandResult::NothingFound);
    EXPECT_EQ(ProgressLines(), Strings({"", "Total number of objects: 0"}));
}

TEST_F(FindDoubledObjectsTest, UnreadableCatalogueTellsAndTouchesNothing) {
    CatalogueFolder = Folder("missing");
    ProgressListOn = true;
    OpenProgressList();
    AddProgressLine("kept");
    EXPECT_EQ(FindDoubledObjects(), CommandResult::Failed);
    EXPECT_EQ(Messages(), Strings({"static.ini failure: Can't open static.ini"}));
    EXPECT_EQ(ProgressLines(), Strings({"kept"}));
    EXPECT_TRUE(HeadlessProcesses().empty());
}

TEST_F(FindDoubledObjectsTest, ReportThatCannotBeWrittenIsNoSuccess) {
    UseCatalogue(Headers({"A", "A"}));
    HeadlessFileFaults faults;
    faults.failCreate = "Doubled_objects.txt";
    HeadlessSetFileFaults(faults);
    EXPECT_EQ(FindDoubledObjects(), CommandResult::Failed);
    EXPECT_EQ(Messages(), Strings({"Report failure: Can't write Doubled_objects.txt"}));
    EXPECT_TRUE(HeadlessProcesses().empty());
}

TEST_F(FindDoubledObjectsTest, DropsEventsPendingDuringTheRun) {
    UseCatalogue(Headers({"A", "A"}));
    HeadlessPushPending(OtherStep("anything"));
    HeadlessPushPending(OtherStep("anything"));
    FindDoubledObjects();
    Event event;
    EXPECT_FALSE(TakePendingEvent(event));
}

TEST_F(FindDoubledObjectsTest, WithoutFolderAsksAndEndsSilentlyWhenChooserCloses) {
    EXPECT_EQ(FindDoubledObjects(), CommandResult::NoFolder);
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({"Searching static.ini"}));
    EXPECT_EQ(Messages(), Strings{});
}
