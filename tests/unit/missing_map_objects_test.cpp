#include "maps/missing_map_objects.h"

#include "map_records.h"
#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "output/progress_list.h"
#include "test_support.h"

TEST(MissingMapObjects, FirstOrdinalOfEachName) {
    EXPECT_EQ(FirstSectionOrdinals({"A", "B", "a", "A", "C", "", "A "}, {"X", "A", "B", "A", "", " A"}),
              std::vector<int>({1, 2, NotInCatalogue, 1, NotInCatalogue, 4, NotInCatalogue}));
    EXPECT_EQ(FirstSectionOrdinals({"A"}, {}), std::vector<int>({NotInCatalogue}));
}

class FindMissingMapObjectsTest : public ScratchTest {
protected:
    // Writes the map and gives its selection.
    std::string UseMap(const Strings& objectNames) {
        Strings classNames;
        for (const std::string& name : objectNames) classNames.push_back(BuildingClassName(name));
        Write("maps/Fields/actors.static", MapRecordBytes(classNames));
        return Folder("maps/Fields") + "*actors.static";
    }
    void ListOn() {
        ProgressListOn = true;
        OpenProgressList();
        AddProgressLine("left over from an earlier check");
    }
};

TEST_F(FindMissingMapObjectsTest, ReportListsEveryMissingOccurrenceInMapOrder) {
    UseCatalogue(
        "[buildings.House$Kiosk]\r\n  [buildings.House$Barn] // moved\r\n\t[buildings.House$Shed]\r\n"
        "[Buildings.House$Tower]\r\n[buildings.House$mill]\r\n");
    std::string selection = UseMap({"Shed", "Kiosk", "Mill", "Barn", "Shed", "Tower", "Shed"});
    EXPECT_EQ(FindMissingMapObjects(selection, CatalogueFolder), CommandResult::Findings);
    EXPECT_EQ(Desktop("Missing_objects.txt"),
              CrLf({"Missing objects in your static.ini:", "", "buildings.House$Shed", "buildings.House$Mill",
                    "buildings.House$Shed", "buildings.House$Tower", "buildings.House$Shed"}));
    ASSERT_EQ(HeadlessProcesses().size(), 1u);
    EXPECT_EQ(HeadlessProcesses()[0].commandLine, "\"C:\\WINDOWS\\notepad.exe\" Missing_objects.txt");
    EXPECT_EQ(Messages(), Strings{});
    EXPECT_EQ(ProgressList, 0u);
}

TEST_F(FindMissingMapObjectsTest, ProgressLinesAndTotal) {
    UseCatalogue(
        "[***]\r\nTitle House\r\n[buildings.House$A]\r\n[buildings.House$B]\r\n[buildings.House$A]\r\n"
        "[buildings.House$C]\r\n");
    std::string selection = UseMap({"C", "A", "Z", "B", "Z"});
    ListOn();
    FindMissingMapObjects(selection, CatalogueFolder);
    EXPECT_EQ(ProgressLines(),
              Strings({"Found object (3): buildings.House$C", "Found object (0): buildings.House$A",
                       "Missing: buildings.House$Z", "Found object (1): buildings.House$B",
                       "Missing: buildings.House$Z", "", "Total number of objects: 5"}));
}

TEST_F(FindMissingMapObjectsTest, AllFoundOrNoNamesShowsMessageAndWritesNoReport) {
    UseCatalogue("[buildings.House$A]\r\n");
    for (const Strings& names : {Strings({"A", "A"}), Strings{}}) {
        HeadlessReset();
        HeadlessSetDesktopFolder(Folder("Desktop"));
        ListOn();
        EXPECT_EQ(FindMissingMapObjects(UseMap(names), CatalogueFolder), CommandResult::NothingFound);
        EXPECT_EQ(Messages(),
                  Strings({"No missing objects found: All maps objects found in your static.ini"}));
        Strings lines = ProgressLines();
        EXPECT_EQ(Strings(lines.end() - 2, lines.end()),
                  Strings({"", "Total number of objects: " + std::to_string(names.size())}));
        EXPECT_FALSE(Exists("Desktop/Missing_objects.txt"));
        EXPECT_TRUE(HeadlessProcesses().empty());
    }
}

TEST_F(FindMissingMapObjectsTest, UnreadableCatalogueEndsWithoutAWord) {
    std::string selection = UseMap({"Z"});
    ListOn();
    EXPECT_EQ(FindMissingMapObjects(selection, Folder("nowhere")), CommandResult::Failed);
    EXPECT_EQ(Messages(), Strings{});
    EXPECT_EQ(ProgressLines(), Strings({"left over from an earlier check"}));
    EXPECT_TRUE(HeadlessProcesses().empty());
}

TEST_F(FindMissingMapObjectsTest, ReportThatCannotBeWrittenIsNoSuccess) {
    UseCatalogue("[buildings.House$A]\r\n");
    HeadlessFileFaults faults;
    faults.failWriteName = "Missing_objects.txt";
    faults.failWriteAfterBytes = 10;
    HeadlessSetFileFaults(faults);
    EXPECT_EQ(FindMissingMapObjects(UseMap({"Z"}), CatalogueFolder), CommandResult::Failed);
    EXPECT_EQ(Messages(), Strings({"Report failure: Can't write Missing_objects.txt"}));
    EXPECT_TRUE(HeadlessProcesses().empty());
}
