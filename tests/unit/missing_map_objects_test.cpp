#include "maps/missing_map_objects.h"

#include "map_records.h"
#include "platform/headless/headless.h"
#include "shell/app_state.h"
#include "shell/progress_list.h"
#include "test_support.h"

#include <algorithm>

namespace {

std::string Headers(const Strings& names) {
    std::string text;
    for (const std::string& name : names) text += "[buildings.House$" + name + "]\r\nMesh 3do/x.sim\r\n";
    return text;
}

Strings ClassNames(const Strings& objectNames) {
    Strings classNames;
    for (const std::string& name : objectNames) classNames.push_back(BuildingClassName(name));
    return classNames;
}

// The lookup as a walk from the first header for every name.
std::vector<int> WalkedOrdinals(const Strings& names, const Strings& sections) {
    std::vector<int> ordinals;
    for (const std::string& name : names) {
        int found = NotInCatalogue;
        for (std::size_t k = 0; k < sections.size() && found == NotInCatalogue; ++k)
            if (sections[k] == name) found = static_cast<int>(k);
        ordinals.push_back(found);
    }
    return ordinals;
}

}  // namespace

TEST(MissingMapObjects, FirstOrdinalOfEachName) {
    EXPECT_EQ(FirstSectionOrdinals({"A", "B", "a", "A", "C", ""}, {"X", "A", "B", "A", ""}),
              std::vector<int>({1, 2, NotInCatalogue, 1, NotInCatalogue, 4}));
    EXPECT_EQ(FirstSectionOrdinals({"A"}, {}), std::vector<int>({NotInCatalogue}));
    EXPECT_EQ(FirstSectionOrdinals({}, {"A"}), std::vector<int>{});
    EXPECT_EQ(FirstSectionOrdinals({"A "}, {"A", " A"}), std::vector<int>({NotInCatalogue}));
}

TEST(MissingMapObjects, LookupGivesTheNumbersOfTheWalk) {
    Strings sections, names;
    for (int i = 0; i < 400; ++i) sections.push_back("s" + std::to_string((i * 37) % 150));
    for (int i = 0; i < 300; ++i) names.push_back("s" + std::to_string((i * 11) % 220));
    std::vector<int> ordinals = FirstSectionOrdinals(names, sections);
    EXPECT_EQ(ordinals, WalkedOrdinals(names, sections));
    EXPECT_NE(std::count(ordinals.begin(), ordinals.end(), NotInCatalogue), 0);
}

class FindMissingMapObjectsTest : public ScratchTest {
protected:
    // Writes the map and gives its selection.
    std::string UseMap(const Strings& classNames) {
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
        "[buildings.House$Kiosk]\r\n"
        "  [buildings.House$Barn] // moved\r\n"
        "\t[buildings.House$Shed]\r\n"
        "[Buildings.House$Tower]\r\n"
        "[buildings.House$mill]\r\n");
    std::string selection = UseMap(ClassNames({"Shed", "Kiosk", "Mill", "Barn", "Shed", "Tower", "Shed"}));
    EXPECT_EQ(FindMissingMapObjects(selection, CatalogueFolder), CommandResult::Findings);
    EXPECT_EQ(Desktop("Missing_objects.txt"),
              CrLf({"Missing objects in your static.ini:", "", "buildings.House$Shed", "buildings.House$Mill",
                    "buildings.House$Shed", "buildings.House$Tower", "buildings.House$Shed"}));
    ASSERT_EQ(HeadlessProcesses().size(), 1u);
    EXPECT_EQ(HeadlessProcesses()[0].commandLine, "\"C:\\WINDOWS\\notepad.exe\" Missing_objects.txt");
    EXPECT_EQ(HeadlessProcesses()[0].workingFolder, Folder("Desktop"));
    EXPECT_EQ(Messages(), Strings{});
}

TEST_F(FindMissingMapObjectsTest, ProgressLinesAndTotal) {
    UseCatalogue("[***]\r\nTitle House\r\n" + Headers({"A", "B", "A", "C"}));
    std::string selection = UseMap(ClassNames({"C", "A", "Z", "B", "Z"}));
    ListOn();
    FindMissingMapObjects(selection, CatalogueFolder);
    EXPECT_EQ(ProgressLines(),
              Strings({"Found object (3): buildings.House$C", "Found object (0): buildings.House$A",
                       "Missing: buildings.House$Z", "Found object (1): buildings.House$B",
                       "Missing: buildings.House$Z", "", "Total number of objects: 5"}));
}

TEST_F(FindMissingMapObjectsTest, ListOffGivesTheSameReportAndNoLines) {
    UseCatalogue(Headers({"A"}));
    std::string selection = UseMap(ClassNames({"A", "Z"}));
    EXPECT_EQ(FindMissingMapObjects(selection, CatalogueFolder), CommandResult::Findings);
    EXPECT_EQ(Desktop("Missing_objects.txt"),
              CrLf({"Missing objects in your static.ini:", "", "buildings.House$Z"}));
    EXPECT_EQ(ProgressList, 0u);
}

TEST_F(FindMissingMapObjectsTest, AllFoundOrNoNamesShowsMessageAndWritesNoReport) {
    struct Case {
        Strings classNames;
        std::string total;
    };
    const Case cases[] = {
        {ClassNames({"A", "A"}), "Total number of objects: 2"},
        {{"com.maddox.il2.objects.vehicles.artillery.Artillery$Flak"}, "Total number of objects: 0"},
    };
    for (const Case& c : cases) {
        HeadlessReset();
        HeadlessSetDesktopFolder(Folder("Desktop"));
        UseCatalogue(Headers({"A"}));
        std::string selection = UseMap(c.classNames);
        ListOn();
        EXPECT_EQ(FindMissingMapObjects(selection, CatalogueFolder), CommandResult::NothingFound);
        EXPECT_EQ(Messages(),
                  Strings({"No missing objects found: All maps objects found in your static.ini"}));
        EXPECT_EQ(ProgressLines().back(), c.total);
        EXPECT_EQ(ProgressLines()[ProgressLines().size() - 2], "");
        EXPECT_FALSE(Exists("Desktop/Missing_objects.txt"));
        EXPECT_TRUE(HeadlessProcesses().empty());
    }
}

TEST_F(FindMissingMapObjectsTest, UnreadableCatalogueEndsWithoutAWord) {
    std::string selection = UseMap(ClassNames({"Z"}));
    ListOn();
    EXPECT_EQ(FindMissingMapObjects(selection, Folder("nowhere")), CommandResult::Failed);
    EXPECT_EQ(Messages(), Strings{});
    EXPECT_EQ(ProgressLines(), Strings({"left over from an earlier check"}));
    EXPECT_FALSE(Exists("Desktop/Missing_objects.txt"));
    EXPECT_TRUE(HeadlessProcesses().empty());
}

TEST_F(FindMissingMapObjectsTest, ReportThatCannotBeWrittenIsNoSuccess) {
    UseCatalogue(Headers({"A"}));
    std::string selection = UseMap(ClassNames({"Z"}));
    HeadlessFileFaults faults;
    faults.failWriteName = "Missing_objects.txt";
    faults.failWriteAfterBytes = 10;
    HeadlessSetFileFaults(faults);
    EXPECT_EQ(FindMissingMapObjects(selection, CatalogueFolder), CommandResult::Failed);
    EXPECT_EQ(Messages(), Strings({"Report failure: Can't write Missing_objects.txt"}));
    EXPECT_TRUE(HeadlessProcesses().empty());
}

TEST_F(FindMissingMapObjectsTest, DropsEventsPendingDuringTheRun) {
    UseCatalogue(Headers({"A"}));
    std::string selection = UseMap(ClassNames({"A", "Z"}));
    for (int i = 0; i < 3; ++i) HeadlessPushPending(OtherStep("anything"));
    FindMissingMapObjects(selection, CatalogueFolder);
    Event event;
    EXPECT_FALSE(TakePendingEvent(event));
}
