#include "checks/mesh_folder_search.h"
#include "checks/mesh_references.h"

#include "plain_mesh_search.h"
#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "output/progress_list.h"
#include "test_support.h"

#include <algorithm>
#include <chrono>
#include <filesystem>
#include <random>

namespace {

TextStore EntryText;  // what the entries of every test view

MeshIndexEntry Entry(std::string_view title, std::string_view mesh, std::string_view live = "",
                     std::string_view dead = "") {
    MeshIndexEntry entry;
    entry.title = EntryText.Keep(title);
    entry.mesh = EntryText.Keep(mesh);
    entry.meshLive = EntryText.Keep(live);
    entry.meshDead = EntryText.Keep(dead);
    return entry;
}

std::string Flags(const std::vector<MeshIndexEntry>& index) {
    std::string flags;
    for (const MeshIndexEntry& entry : index)
        flags += std::string(entry.meshFound ? "1" : "0") + (entry.meshLiveFound ? "1" : "0") +
                 (entry.meshDeadFound ? "1" : "0") + " ";
    return flags;
}

// The positions the bar takes after so many visits: the first move after 5000, then every 4999.
std::vector<int> BarMovesAfter(long long visits) {
    std::vector<int> positions;
    for (long long at = 5000; at <= visits; at += 4999)
        positions.push_back(static_cast<int>(positions.size()) % 35 + 1);
    return positions;
}

}  // namespace

TEST(MeshFolderSearch, BarMovesAtItsVisitCounts) {
    HeadlessReset();
    Handle window = OpenTopWindow("Wait", 0, 0, 10, 10, FrameStyle{});
    Handle bar = AddProgressBar(window, 0, 0, 10, 10, 0, 35);
    VisitCounter counter;
    struct Step {
        std::size_t visits;
        long long total;
    };
    long long total = 0;
    for (Step step : {Step{4999, 4999}, Step{1, 5000}, Step{4998, 9998}, Step{1, 9999}, Step{0, 9999},
                      Step{35 * 4999, 9999 + 35 * 4999}, Step{123457, 9999 + 35 * 4999 + 123457}}) {
        CountVisits(counter, step.visits, bar);
        total += static_cast<long long>(step.visits);
        ASSERT_EQ(total, step.total);
        EXPECT_EQ(HeadlessControlOf(bar)->positionsSet, BarMovesAfter(total)) << total;
    }
}

class MeshFolderSearchTest : public ScratchTest {
protected:
    std::string ModsRoot() const { return Folder("Game/mods"); }
    void Mesh(const std::string& relative) const { Write("Game/" + relative, "sim"); }
    Handle NewBar() const {
        return AddProgressBar(OpenTopWindow("Wait", 400, 340, 180, 40, FrameStyle{}), 10, 10, 160, 20, 0, 35);
    }
};

TEST_F(MeshFolderSearchTest, BarCountsEveryEntryOncePerSearchedFolder) {
    std::vector<MeshIndexEntry> index(2600, Entry("", "3do\\x.sim"));
    index[7] = Entry("Title Mods", "3do\\mod7\\x.sim");
    for (int mod = 0; mod < 70; ++mod) Write("Game/mods/Mod" + std::to_string(mod) + "/3do/readme", "");
    Mesh("mods/Mod7/3do/mod7/x.sim");
    Write("Game/mods/NoMeshes/3do_old/x.sim", "");
    Handle bar = NewBar();
    SearchModMeshFolders(index, ModsRoot(), bar);
    EXPECT_EQ(HeadlessControlOf(bar)->positionsSet, BarMovesAfter(2600LL * 70));
    EXPECT_EQ(Flags({index[7]}), "100 ");
}

// Random trees with folders in other letter cases, decoys and odd path names: the search must give
// the plain search's flags, lines and bar moves, with fewer opens.
TEST_F(MeshFolderSearchTest, MatchesThePlainSearchOnRandomTrees) {
    const Strings names = {"a.sim", "A.sim", "B.sim", "live.sim", "dead.SIM", "x"};
    const Strings folders = {"Buildings", "buildings", "Sea", "Zone", "zONE", "m.sim"};
    const Strings meshFolders = {"3do", "3DO", "3Do", "3do_old", "3d0"};
    for (unsigned seed = 1; seed <= 6; ++seed) {
        std::mt19937 random(seed);
        auto pick = [&random](const Strings& from) { return from[random() % from.size()]; };
        std::string game = "Game" + std::to_string(seed);
        std::string mods = game + "/mods";
        auto randomPath = [&] {
            std::string path;
            for (unsigned depth = random() % 2; depth > 0; --depth) path += pick(folders) + "/";
            return path + pick(names);
        };
        for (int mod = 0; mod < 6; ++mod) {
            std::string modFolder = mod == 0 ? mods : mods + "/Mod" + std::to_string(mod);
            for (int file = 0; file < 6; ++file)
                Write(modFolder + "/" + pick(meshFolders) + "/" + randomPath(), "x");
        }
        Write(game + "/3do/" + randomPath(), "x");
        std::vector<MeshIndexEntry> index;
        const Strings odd = {"",      "",    "3do\\.\\a.sim", "3do\\..\\3do\\a.sim", "3do\\a.sim.",
                             "3DO\\", "3do", "3do\\m.sim",    "3do_old\\a.sim",      "3do\\Sea\\\\a.sim"};
        auto value = [&] {
            if (random() % 4 == 0) return pick(odd);
            std::string path = pick(meshFolders) + "/" + randomPath();
            std::replace(path.begin(), path.end(), '/', '\\');
            return path;
        };
        for (int entry = 0; entry < 60; ++entry)
            index.push_back(Entry(random() % 5 == 0 ? "" : "Title Mods", value(), value(), value()));
        std::vector<MeshIndexEntry> plainIndex = index;

        HeadlessReset();
        ProgressListOn = true;
        OpenProgressList();
        Handle bar = NewBar();
        SearchModMeshFoldersPlainly(plainIndex, Folder(mods), bar);
        HeadlessFileCounters plain = HeadlessCounters();
        Strings plainLines = ProgressLines();
        std::vector<int> plainMoves = HeadlessControlOf(bar)->positionsSet;

        HeadlessReset();
        OpenProgressList();
        bar = NewBar();
        SearchModMeshFolders(index, Folder(mods), bar);
        EXPECT_EQ(Flags(index), Flags(plainIndex)) << "seed " << seed;
        EXPECT_EQ(ProgressLines(), plainLines) << "seed " << seed;
        EXPECT_EQ(HeadlessControlOf(bar)->positionsSet, plainMoves) << "seed " << seed;
        EXPECT_LT(HeadlessCounters().opens, plain.opens) << "seed " << seed;
        EXPECT_NE(Flags(index).find('1'), std::string::npos) << "seed " << seed;
    }
}

// A folder matched in another letter case is taken again only while it is there: renamed, it is
// matched anew, for a file in it and for one below it that no search opened before.
TEST_F(MeshFolderSearchTest, AFolderMatchedBeforeCountsOnlyWhileItIsThere) {
    Mesh("mods/Pack/3DO/a/x.sim");
    Mesh("mods/Pack/3DO/b/y.sim");
    std::vector<MeshIndexEntry> index = {Entry("Title Mods", "3do\\a\\x.sim")};
    SearchModMeshFolders(index, ModsRoot(), NewBar());
    ASSERT_EQ(Flags(index), "100 ");
    std::filesystem::rename(Host("Game/mods/Pack/3DO"), Host("Game/mods/Pack/3dO"));
    index = {Entry("Title Mods", "3do\\a\\x.sim", "3do\\b\\y.sim")};
    SearchModMeshFolders(index, ModsRoot(), NewBar());
    EXPECT_EQ(Flags(index), "110 ");
}

// Mod folders come in the order in which NTFS lists them: names compared as upper case, so "_" and
// "[" sort after every letter, after "." (the mods folder itself) and "..", which come first.
TEST_F(MeshFolderSearchTest, ModFoldersInTheOrderNtfsListsThem) {
    for (const std::string mod : {"_Late", "zeta", "Alpha", "[x]", "beta", "(old)"})
        Write("Game/mods/" + mod + "/3do/a", "");
    Write("Game/mods/3do/a", "");
    ProgressListOn = true;
    OpenProgressList();
    std::vector<MeshIndexEntry> index;
    SearchModMeshFolders(index, ModsRoot(), NewBar());
    Strings expected;
    for (const std::string mod : {".", "(old)", "Alpha", "beta", "zeta", "[x]", "_Late"})
        expected.push_back("Check: ...\\mods\\" + mod + "\\3do");
    EXPECT_EQ(ProgressLines(), expected);
}

// Values no listing can judge are opened in every searched folder: the folder that holds them is
// listed once for their letter case, and a climb of many ".." parts is read by its text.
TEST_F(MeshFolderSearchTest, OddValuesDoNotStallTheSearch) {
    Mesh("mods/Pack/3do/Many/f.sim");
    Mesh("mods/Other/3DO/Many/g.sim");
    std::vector<MeshIndexEntry> index;
    for (int i = 0; i < 200; ++i)
        index.push_back(Entry("Title Mods", "3do\\Many\\t~" + std::to_string(i) + ".sim"));
    std::string climb, deep;
    for (int i = 0; i < 100000; ++i) climb += "..\\";
    for (int i = 0; i < 16000; ++i) deep += "x\\";
    index.push_back(Entry("Title Mods", "3do\\" + climb + "x.sim"));
    auto start = std::chrono::steady_clock::now();
    SearchModMeshFolders(index, ModsRoot(), NewBar());
    EXPECT_EQ(HeadlessCounters().caseListings, 4)
        << "each Many folder, the 3DO one's mod, the root climbed to";
    EXPECT_FALSE(MakeFolderCurrent(Folder("Game") + deep));
    EXPECT_LT(std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count(), 5);
}

// However few entries a window holds, both checks, alone or sharing an index as check-all does,
// give what one window gives: the progress lines, the report and the result.
TEST_F(MeshFolderSearchTest, SmallWindowsCheckAsOneWindowDoes) {
    UseCatalogue(CrLf({"Mesh 3do/before.sim", "[***]", "Title House", "[buildings.House$Std]", "Mesh 3do/std.sim",
                       "[***]", "Title Mods", "[buildings.House$A]", "Mesh 3do/a.sim", "MeshLive 3do/a.sim",
                       "MeshDead 3do/a.sim", "[buildings.House$B]", "MeshLive 3do/b/l.sim", "MeshDead 3do/b/d.sim",
                       "[***]", "Title Humans", "[buildings.House$H]", "Mesh 3do/h.sim", "[***]", "Title House",
                       "[buildings.House$Std2]", "[***]", "Title Mods", "[buildings.House$C]", "Mesh 3do/C.SIM",
                       "[buildings.House$E]"}),
                 "Game/mods/std/com/maddox/il2/objects");
    Mesh("mods/Pack/3do/a.sim");
    Mesh("mods/Pack/3do/b/d.sim");
    Mesh("mods/Pack/3do/c.sim");
    ProgressListOn = true;
    auto run = [&](std::size_t window) {
        std::string outputs;
        SharedMeshIndex shared;
        shared.forASecondCheck = true;
        for (MeshCheck check : {MeshCheck::MissingMeshes, MeshCheck::SharedLiveDeadMeshes}) {
            for (bool sharing : {false, true}) {
                OpenProgressList();
                int findings = 0;
                CommandResult result = sharing ? CheckMeshReferencesSharing(CatalogueFolder, ModsRoot(), check,
                                                                            shared, findings, window)
                                               : CheckMeshReferences(CatalogueFolder, ModsRoot(), check, window);
                outputs += std::to_string(static_cast<int>(result)) + " " + std::to_string(findings) + "\n" +
                           Desktop(check == MeshCheck::MissingMeshes ? "Missing_3do.txt" : "Doubled_sims_or_meshes.txt") +
                           CrLf(ProgressLines());
            }
        }
        return outputs;
    };
    const std::string whole = run(MeshWindowEntries);
    EXPECT_NE(whole.find("Not found: MeshLive 3do\\b\\l.sim"), std::string::npos);
    EXPECT_NE(whole.find("Excluding buildings.House$Std2"), std::string::npos);
    EXPECT_NE(whole.find("Check: ...\\mods\\Pack\\3do"), std::string::npos);
    for (std::size_t window : {1, 2, 3, 5}) EXPECT_EQ(run(window), whole) << window << " entries a window";
}

// The Wait window's bar counts on over the windows: it moves as for one window.
TEST_F(MeshFolderSearchTest, BarMovesOverWindowsAsForOne) {
    Strings catalogue = {"[***]", "Title Mods"};
    for (int entry = 0; entry < 2000; ++entry) catalogue.push_back("[buildings.House$F" + std::to_string(entry) + "]");
    UseCatalogue(CrLf(catalogue), "Game/mods/std/com/maddox/il2/objects");
    for (const char* mod : {"A", "B", "C"}) Write("Game/mods/" + std::string(mod) + "/3do/readme", "");
    auto barMoves = [&](std::size_t window) {
        Handle bar = 0;
        HeadlessPushPending([&bar] {
            bar = HeadlessControlByKind(HeadlessFindWindow("Wait"), "progress");
            return Event();
        });
        CheckMeshReferences(CatalogueFolder, ModsRoot(), MeshCheck::MissingMeshes, window);
        return HeadlessControlOf(bar)->positionsSet;
    };
    EXPECT_EQ(barMoves(MeshWindowEntries), BarMovesAfter(2000LL * 3));
    EXPECT_EQ(barMoves(700), BarMovesAfter(2000LL * 3));
}
