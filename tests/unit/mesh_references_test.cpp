#include "checks/mesh_references.h"

#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "output/progress_list.h"
#include "test_support.h"

#include <algorithm>

namespace {

const std::string Header =
    "Obects sorted within standard titles (example: 'Title Furniture') up to 4.09b are not "
    "checked\r\nMod objects using sims/meshes of standard objects will cause wrong alert\r\n";
const std::string MissingHeader = Header + "Wrong sim references in your static.ini:\r\n\r\n";
const std::string DoubledHeader = Header + "Doubled used sims in your static.ini:\r\n\r\n";
const std::string Stars14(14, '*'), Stars38(38, '*');

std::string Describe(const MeshIndexEntry& entry) {
    return std::to_string(entry.number) + "|" + entry.title + "|" + entry.sectionName + "|" + entry.mesh +
           "|" + entry.meshLive + "|" + entry.meshDead;
}

// The lines a run added after "Searching folders & files" and its blank.
Strings AfterSearchingLines(const Strings& lines) {
    auto at = std::find(lines.begin(), lines.end(), "Searching folders & files");
    return at == lines.end() ? Strings{} : Strings(at + 2, lines.end());
}

// A block of the missing-meshes output: the ruler, the object line, the section name, the mesh lines.
Strings Block(int number, const std::string& house, const Strings& meshLines) {
    Strings block = {Stars14, "Object (" + std::to_string(number) + ")", "buildings.House$" + house};
    block.insert(block.end(), meshLines.begin(), meshLines.end());
    return block;
}

}  // namespace

TEST(MeshReferences, CutsTheValueFromItsFirst3do) {
    struct Case {
        std::string line;
        bool cut;
        std::string value;
    };
    const Case cases[] = {
        {"Mesh 3do/Buildings/Sea/Pier/mono.sim", true, "3do\\Buildings\\Sea\\Pier\\mono.sim"},
        {"MeshLive ../3DO/x/live.sim", true, "3DO\\x\\live.sim"},
        {"MeshDead C:\\game\\3dO/a\\b.sim", true, "3dO\\a\\b.sim"},
        {"Mesh x3dox/3do/y.sim", true, "3dox\\3do\\y.sim"},
        {"Mesh 3do//y.sim", true, "3do\\\\y.sim"},
        {"Mesh3do", true, "3do"},
        {"Mesh Buildings/Sea/mono.sim", false, "kept"},
        {"Mesh 3d o/x.sim", false, "kept"},
    };
    for (const Case& c : cases) {
        std::string value = "kept";
        EXPECT_EQ(CutMeshValue(c.line, value), c.cut) << c.line;
        EXPECT_EQ(value, c.value) << c.line;
    }
}

class MeshIndexTest : public ScratchTest {
protected:
    Strings IndexOf(const Strings& lines) {
        UseCatalogue(CrLf(lines));
        std::vector<MeshIndexEntry> index;
        EXPECT_TRUE(BuildMeshIndex(CatalogueFolder, index));
        Strings described;
        for (const MeshIndexEntry& entry : index) described.push_back(Describe(entry));
        return described;
    }
};

TEST_F(MeshIndexTest, ReadsEntriesFromTheFirstGroupMarkerOn) {
    EXPECT_EQ(
        IndexOf({"[buildings.House$Before]",
                 "Mesh 3do/before.sim",
                 "[***] note",
                 "  [***]  ",
                 " Title Mods ",
                 "Mesh 3do/orphan.sim",
                 "(0)",
                 "[buildings.House$A]",
                 "Mesh 3do/a/one.sim",
                 "Mesh 3do/a/two.sim",
                 "Mesh a/no/mesh/folder.sim",
                 "MeshLiveX 3do/a/live.sim",
                 "MeshDead   ../3DO/a/dead.sim",
                 "[Buildings.House$Capital]",
                 "Mesh 3do/capital.sim",
                 "[airfield.Thing]",
                 "MeshDead 3do/air.sim",
                 "Mesh",
                 "Mesh\t3do/tab.sim",
                 "[buildings.Plate$B] // note",
                 "[***]",
                 "[buildings.House$Title]",
                 "MeshLive 3do/b.sim",
                 "[***]",
                 "[bui",
                 "[buildings.House$C]"}),
        Strings({"0| Title Mods |buildings.House$A|3do\\capital.sim|3do\\a\\live.sim|3do\\air.sim",
                 "1| Title Mods |buildings.Plate$B] // not||3do\\b.sim|", "2|[bui|buildings.House$C|||"}));
}

TEST_F(MeshIndexTest, CatalogueWithoutGroupMarkerGivesNoEntries) {
    EXPECT_EQ(IndexOf({"[buildings.House$A]", "Mesh 3do/a.sim", "[***]x"}), Strings{});
    EXPECT_EQ(IndexOf({"[buildings.House$A]", "[***]"}), Strings{});
}

TEST_F(MeshIndexTest, ExcludesStandardGroupsByTheirWholeTitleLine) {
    struct Case {
        std::string firstTitle, laterTitle;
        bool firstExcluded, laterExcluded;
    };
    const Case cases[] = {
        {"Title House", "Title Humans", true, true},
        {"Title House ", "  Title House  ", false, true},
        {"\tTitle Sea", "Title Sea\t", false, false},
        {"Title house", "Title Houses of Kiev Winter", false, false},
        {"Title Houses of Kiev winter", "Title HouseWinter", true, true},
        {"Title Mods", "", false, true},
    };
    for (const Case& c : cases) {
        UseCatalogue(CrLf(
            {"[***]", c.firstTitle, "[buildings.House$A]", "[***]", c.laterTitle, "[buildings.House$B]"}));
        std::vector<MeshIndexEntry> index;
        ASSERT_TRUE(BuildMeshIndex(CatalogueFolder, index));
        ExcludeStandardTitles(index);
        ASSERT_EQ(index.size(), 2u);
        EXPECT_EQ(index[0].title.empty(), c.firstExcluded) << c.firstTitle;
        EXPECT_EQ(index[1].title.empty(), c.laterExcluded) << c.laterTitle;
    }
}

TEST_F(MeshIndexTest, ExclusionShowsEachTitleAndEachExcludedEntry) {
    UseCatalogue(CrLf({"[***]", "Title Humans", "[buildings.House$Man]", "[***]", "Title House",
                       "[buildings.House$Hut]", "[***]", "Title Mods", "[buildings.House$Mine]", "[***]",
                       "Title Humans", "[buildings.House$Woman]"}));
    ProgressListOn = true;
    OpenProgressList();
    std::vector<MeshIndexEntry> index;
    ASSERT_TRUE(BuildMeshIndex(CatalogueFolder, index));
    ExcludeStandardTitles(index);
    const std::string ruler = "//**************************";
    Strings lines = ProgressLines();
    ASSERT_EQ(lines.size(), 3 + 42 * 3 + 3u);
    EXPECT_EQ(Strings(lines.begin(), lines.begin() + 7),
              Strings({ruler, "Excluding Standard Titles", " ", ruler, "Excluding Title House", " ",
                       "Excluding buildings.House$Hut"}));
    EXPECT_EQ(Strings(lines.end() - 5, lines.end()),
              Strings({ruler, "Excluding Title Humans", " ", "Excluding buildings.House$Man",
                       "Excluding buildings.House$Woman"}));
    EXPECT_EQ(index[2].title, "Title Mods");
}

class CheckMeshReferencesTest : public ScratchTest {
protected:
    std::string ModsRoot() const { return Folder("Game/mods"); }
    void Mesh(const std::string& relative) const { Write("Game/" + relative, "sim"); }
    void UseModsCatalogue(const Strings& lines) {
        UseCatalogue(CrLf(lines), "Game/mods/std/com/maddox/il2/objects");
    }
    // Catches the Wait window at the run's first drain of events.
    void WatchWaitWindow() {
        HeadlessPushPending([this] {
            waitWindow = HeadlessFindWindow("Wait");
            return Event();
        });
    }
    const HeadlessControl* WaitBar() const {
        return HeadlessControlOf(HeadlessControlByKind(waitWindow, "progress"));
    }

    Handle waitWindow = 0;
};

TEST_F(CheckMeshReferencesTest, MissingModeListsEveryMeshAndReportsTheMissingOnes) {
    UseModsCatalogue({"[***]",
                      "Title House",
                      "[buildings.House$Std]",
                      "Mesh 3do/Std/gone.sim",
                      "[***]",
                      "Title Mods",
                      "[buildings.House$Both]",
                      "Mesh 3do/Both/mono.sim",
                      "MeshLive 3do/Both/live.sim",
                      "[buildings.House$LiveOnly]",
                      "MeshLive 3do/L/live.sim",
                      "MeshDead 3do/L/dead.sim",
                      "[buildings.House$NoneFound]",
                      "MeshLive 3do/N/live.sim",
                      "MeshDead 3do/N/dead.sim",
                      "[buildings.House$DeadOnly]",
                      "MeshDead 3DO/D/dead.sim",
                      "[buildings.House$Fine]",
                      "Mesh 3do/F/mono.sim",
                      "MeshLive 3do/F/live.sim",
                      "MeshDead 3do/F/dead.sim",
                      "[buildings.House$Bare]",
                      "Body x"});
    Mesh("mods/ModA/3DO/L/live.sim");         // capital 3DO folder is searched, its name matched in any case
    Mesh("mods/ModA/3do_old/Both/mono.sim");  // a decoy: no such folder is searched
    Mesh("mods/3do/F/mono.sim");              // the mods root's own 3do folder, through "."
    Mesh("3do/F/live.sim");                   // the folder above the mods root, through ".."
    Mesh("mods/ModB/3do/f/DEAD.SIM");
    Mesh("mods/ModB/3do/Both/mono.sim/inside");  // a folder is not a mesh file
    Mesh("mods/ModC/nothing.txt");
    Write("Game/mods/loose.txt", "x");
    ProgressListOn = true;
    OpenProgressList();

    EXPECT_EQ(CheckMeshReferences(ModsRoot(), "missing"), CommandResult::Findings);

    Strings list = {"Check: ...\\mods\\.\\3do",
                    "Check: ...\\mods\\..\\3do",
                    "Check: ...\\mods\\ModA\\3do",
                    "Check: ...\\mods\\ModB\\3do",
                    " ",
                    "//**************************",
                    "Starting output",
                    " "};
    for (const Strings& block :
         {Block(1, "Both", {"Not found: Mesh 3do\\Both\\mono.sim"}),
          Block(1, "Both", {"Not found: MeshLive 3do\\Both\\live.sim"}),
          Block(2, "LiveOnly", {"Found: MeshLive 3do\\L\\live.sim", "Not Found: MeshDead 3do\\L\\dead.sim"}),
          Block(3, "NoneFound",
                {"Not found: MeshLive 3do\\N\\live.sim", "Not Found: MeshDead 3do\\N\\dead.sim"}),
          Block(4, "DeadOnly", {"Not Found: MeshDead 3DO\\D\\dead.sim"}),
          Block(5, "Fine", {"Found: Mesh 3do\\F\\mono.sim"}),
          Block(5, "Fine", {"Found: MeshLive 3do\\F\\live.sim", "Found: MeshDead 3do\\F\\dead.sim"})})
        list.insert(list.end(), block.begin(), block.end());
    EXPECT_EQ(AfterSearchingLines(ProgressLines()), list);
    Strings report;
    for (const Strings& block :
         {Block(1, "Both", {"Not found: Mesh 3do\\Both\\mono.sim"}),
          Block(1, "Both", {"Not found: MeshLive 3do\\Both\\live.sim"}),
          Block(2, "LiveOnly", {"Not found: MeshDead 3do\\L\\dead.sim"}),
          Block(3, "NoneFound",
                {"Not found: MeshLive 3do\\N\\live.sim", "Not found: MeshDead 3do\\N\\dead.sim"}),
          Block(4, "DeadOnly", {"Not found: MeshDead 3DO\\D\\dead.sim"})})
        report.insert(report.end(), block.begin(), block.end());
    EXPECT_EQ(Desktop("Missing_3do.txt"), MissingHeader + CrLf(report));
    ASSERT_EQ(HeadlessProcesses().size(), 1u);
    EXPECT_EQ(HeadlessProcesses()[0].commandLine, "\"C:\\WINDOWS\\notepad.exe\" Missing_3do.txt");
    EXPECT_EQ(Messages(), Strings{});
}

TEST_F(CheckMeshReferencesTest, RunShowsItsStepsInOrder) {
    UseModsCatalogue({"[***]", "Title Mods", "[buildings.House$A]", "Mesh 3do/a.sim"});
    Mesh("mods/ModA/3do/a.sim");
    ProgressListOn = true;
    OpenProgressList();
    AddProgressLine("left over");
    EXPECT_EQ(CheckMeshReferences(ModsRoot(), "missing"), CommandResult::NothingFound);
    Strings lines = ProgressLines();
    const std::string ruler = "//**************************";
    EXPECT_EQ(Strings(lines.begin(), lines.begin() + 5),
              Strings({ruler, "Building object index", ruler, "Excluding Standard Titles", " "}));
    EXPECT_EQ(
        Strings(lines.end() - 17, lines.end()),
        Strings({ruler, "Excluding Title Humans", " ", " ", ruler, "Searching folders & files", " ",
                 "Check: ...\\mods\\ModA\\3do", " ", ruler, "Starting output", " ", Stars14, "Object (0)",
                 "buildings.House$A", "Found: Mesh 3do\\a.sim", "No missing Meshs found"}));
    EXPECT_EQ(Desktop("Missing_3do.txt"), MissingHeader + "No wrong references found\r\n");
}

TEST_F(CheckMeshReferencesTest, DoubledModeListsEntriesWithTheSameLiveAndDeadMesh) {
    UseModsCatalogue({"[***]",
                      "Title Humans",
                      "[buildings.House$Std]",
                      "MeshLive 3do/s.sim",
                      "MeshDead 3do/s.sim",
                      "[***]",
                      "Title Mods",
                      "[buildings.House$Slashes]",
                      "MeshLive 3do/Buildings/A/live.sim",
                      "MeshDead 3do\\Buildings\\A\\live.sim",
                      "[buildings.House$Case]",
                      "MeshLive 3do/a/x.sim",
                      "MeshDead 3DO/a/x.sim",
                      "[buildings.House$Prefix]",
                      "MeshLive ../3do/a/x.sim",
                      "MeshDead mods/3do/a/x.sim",
                      "[buildings.House$NoValue]",
                      "MeshLive a/x.sim",
                      "MeshDead a/x.sim",
                      "[buildings.House$Differ]",
                      "MeshLive 3do/a.sim",
                      "MeshDead 3do/b.sim"});
    Mesh("mods/ModA/3do/unrelated.sim");
    ProgressListOn = true;
    OpenProgressList();
    WatchWaitWindow();

    EXPECT_EQ(CheckMeshReferences(ModsRoot(), "doubled"), CommandResult::Findings);

    EXPECT_EQ(AfterSearchingLines(ProgressLines()),
              Strings({" ", Stars38, "Using the same MeshLive/MeshDead", Stars38, " ", Stars14,
                       "Object (1)buildings.House$Slashes", "MeshLive: 3do\\Buildings\\A\\live.sim",
                       "MeshDead: 3do\\Buildings\\A\\live.sim", Stars14, "Object (3)buildings.House$Prefix",
                       "MeshLive: 3do\\a\\x.sim", "MeshDead: 3do\\a\\x.sim"}));
    EXPECT_EQ(Desktop("Doubled_sims_or_meshes.txt"),
              DoubledHeader +
                  CrLf({" ", Stars38, "Using the same MeshLive/MeshDead", Stars38, " ", Stars14, "Object (1)",
                        "buildings.House$Slashes", "MeshLive: 3do\\Buildings\\A\\live.sim",
                        "MeshDead: 3do\\Buildings\\A\\live.sim", Stars14, "Object (3)",
                        "buildings.House$Prefix", "MeshLive: 3do\\a\\x.sim", "MeshDead: 3do\\a\\x.sim"}));
    ASSERT_NE(WaitBar(), nullptr);
    EXPECT_TRUE(WaitBar()->positionsSet.empty());
    ASSERT_EQ(HeadlessProcesses().size(), 1u);
    EXPECT_EQ(HeadlessProcesses()[0].commandLine, "\"C:\\WINDOWS\\notepad.exe\" Doubled_sims_or_meshes.txt");
}

TEST_F(CheckMeshReferencesTest, NothingFoundStillWritesAndOpensTheReport) {
    struct Case {
        std::string mode, file, body, listEnd;
    };
    const Case cases[] = {
        {"missing", "Missing_3do.txt", MissingHeader + "No wrong references found\r\n",
         "No missing Meshs found"},
        {"doubled", "Doubled_sims_or_meshes.txt",
         DoubledHeader + CrLf({" ", Stars38, "Using the same MeshLive/MeshDead", Stars38, " ",
                               "No doubled used Meshs found"}),
         "No doubled used Meshs found"},
    };
    for (const Case& c : cases) {
        HeadlessReset();
        HeadlessSetDesktopFolder(Folder("Desktop"));
        UseModsCatalogue({"[***]", "Title House", "[buildings.House$Std]", "MeshLive 3do/gone.sim",
                          "MeshDead 3do/gone.sim", "[***]", "Title Mods", "[buildings.House$Bare]"});
        ProgressListOn = true;
        OpenProgressList();
        EXPECT_EQ(CheckMeshReferences(ModsRoot(), c.mode), CommandResult::NothingFound) << c.mode;
        EXPECT_EQ(Desktop(c.file), c.body) << c.mode;
        EXPECT_EQ(ProgressLines().back(), c.listEnd) << c.mode;
        EXPECT_EQ(HeadlessProcesses().size(), 1u) << c.mode;
    }
}

TEST_F(CheckMeshReferencesTest, WaitWindowIsOpenOnlyDuringTheRun) {
    UseModsCatalogue({"[***]", "Title Mods", "[buildings.House$A]", "Mesh 3do/a.sim"});
    WatchWaitWindow();
    CheckMeshReferences(ModsRoot(), "missing");
    ASSERT_NE(waitWindow, 0u);
    const HeadlessWindow* wait = HeadlessWindowOf(waitWindow);
    EXPECT_EQ(wait->title, "Wait");
    EXPECT_EQ(std::vector<int>({wait->left, wait->top, wait->clientWidth, wait->clientHeight}),
              std::vector<int>({400, 340, 180, 40}));
    EXPECT_FALSE(wait->frame.systemMenu);
    EXPECT_FALSE(wait->frame.sizingBorder);
    EXPECT_FALSE(wait->open);
    const HeadlessControl* bar = WaitBar();
    ASSERT_NE(bar, nullptr);
    EXPECT_EQ(std::vector<int>(
                  {bar->left, bar->top, bar->width, bar->height, bar->minimum, bar->maximum, bar->position}),
              std::vector<int>({10, 10, 160, 20, 0, 35, 0}));
}

TEST_F(CheckMeshReferencesTest, UnopenableCatalogueClosesTheWaitWindowAndWritesNoReport) {
    CatalogueFolder = Folder("Game/mods/std/com/maddox/il2/objects");
    EXPECT_EQ(CheckMeshReferences(ModsRoot(), "missing"), CommandResult::Failed);
    EXPECT_EQ(Messages(), Strings({"static.ini failure: Can't open static.ini"}));
    EXPECT_EQ(HeadlessWindowTitlesOpened(), Strings({"Wait"}));
    EXPECT_EQ(HeadlessFindWindow("Wait"), 0u);
    EXPECT_FALSE(Exists("Desktop/Missing_3do.txt"));
    EXPECT_TRUE(HeadlessProcesses().empty());
}

TEST_F(CheckMeshReferencesTest, ReportThatCannotBeWrittenIsNoSuccess) {
    UseModsCatalogue({"[***]", "Title Mods", "[buildings.House$A]", "Mesh 3do/a.sim"});
    HeadlessFileFaults faults;
    faults.failCreate = "Missing_3do.txt";
    HeadlessSetFileFaults(faults);
    EXPECT_EQ(CheckMeshReferences(ModsRoot(), "missing"), CommandResult::Failed);
    EXPECT_EQ(Messages(), Strings({"Report failure: Can't write Missing_3do.txt"}));
    EXPECT_TRUE(HeadlessProcesses().empty());
}

TEST_F(CheckMeshReferencesTest, ListOffAddsNoLinesButReportsTheSame) {
    UseModsCatalogue({"[***]", "Title Mods", "[buildings.House$A]", "Mesh 3do/a.sim"});
    EXPECT_EQ(CheckMeshReferences(ModsRoot(), "missing"), CommandResult::Findings);
    EXPECT_EQ(ProgressList, 0u);
    EXPECT_EQ(Desktop("Missing_3do.txt"), MissingHeader + CrLf({Stars14, "Object (0)", "buildings.House$A",
                                                                "Not found: Mesh 3do\\a.sim"}));
}
