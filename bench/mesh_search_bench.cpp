// The mesh folder search against the plain one (every set mesh opened once per searched folder) on
// one generated modification tree: time, file opens and listings, and their ratios.
//
//   mesh_search_bench [FOLDER] [ENTRIES] [MODS]     defaults: a temp folder, 20000, 300
//
// Entry i names three meshes under the 3do folder of mod i % MODS; the tree holds most of them. Every
// tenth dead mesh and every fiftieth object are missing, every eighth entry shares one mesh that only
// the first mod holds, and every twentieth entry stands in a standard group.
#include "checks/mesh_folder_search.h"
#include "plain_mesh_search.h"
#include "platform/headless/headless.h"
#include "output/app_state.h"

#include <chrono>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <string>

namespace fs = std::filesystem;

namespace {

struct Tree {
    std::string folder;
    int entries = 20000;
    int mods = 300;
};

std::string ObjectFolder(const Tree& tree, int entry) {
    return "3do/Buildings/Mod" + std::to_string(entry % tree.mods) + "/Obj" + std::to_string(entry);
}

std::string ModFolder(const Tree& tree, int mod) {
    return tree.folder + "/mods/Mod" + std::to_string(mod) + "/";
}

void WriteMesh(const std::string& path) {
    fs::create_directories(fs::path(path).parent_path());
    std::ofstream(path, std::ios::binary) << "sim";
}

// Made once per size; a stamp file tells that the tree is complete.
void GenerateTree(const Tree& tree) {
    std::string stamp =
        tree.folder + "/generated-" + std::to_string(tree.entries) + "x" + std::to_string(tree.mods);
    if (fs::exists(stamp)) return;
    fs::remove_all(tree.folder);
    for (int mod = 0; mod < tree.mods; ++mod) fs::create_directories(ModFolder(tree, mod) + "3do/Plane");
    WriteMesh(ModFolder(tree, 0) + "3do/Buildings/Common/mono.sim");
    for (int entry = 0; entry < tree.entries; ++entry) {
        if (entry % 50 == 7) continue;
        std::string object = ModFolder(tree, entry % tree.mods) + ObjectFolder(tree, entry);
        WriteMesh(object + "/mono.sim");
        WriteMesh(object + "/live.sim");
        if (entry % 10 != 3) WriteMesh(object + "/dead.sim");
    }
    std::ofstream(stamp) << "";
}

std::vector<MeshIndexEntry> MakeIndex(const Tree& tree, TextStore& text) {
    std::vector<MeshIndexEntry> index(static_cast<std::size_t>(tree.entries));
    for (int entry = 0; entry < tree.entries; ++entry) {
        MeshIndexEntry& e = index[static_cast<std::size_t>(entry)];
        std::string object = ObjectFolder(tree, entry);
        for (char& c : object)
            if (c == '/') c = '\\';
        e.number = entry;
        e.title = entry % 20 == 0 ? "" : "Title Mods";
        e.sectionName = text.Keep("buildings.House$Obj" + std::to_string(entry));
        e.mesh = entry % 8 == 0 ? "3do\\Buildings\\Common\\mono.sim" : text.Keep(object + "\\mono.sim");
        e.meshLive = text.Keep(object + "\\live.sim");
        e.meshDead = text.Keep(object + "\\dead.sim");
    }
    return index;
}

struct Run {
    double seconds = 0;
    HeadlessFileCounters counters;
    std::vector<int> barMoves;
    std::string flags;
};

Run Measure(const Tree& tree, void (*search)(std::vector<MeshIndexEntry>&, const std::string&, Handle)) {
    HeadlessReset();
    ProgressListOn = false;
    Handle bar =
        AddProgressBar(OpenTopWindow("Wait", 400, 340, 180, 40, FrameStyle{}), 10, 10, 160, 20, 0, 35);
    TextStore text;
    std::vector<MeshIndexEntry> index = MakeIndex(tree, text);
    std::string modsRoot = HeadlessProgramPath(tree.folder + "/mods") + "\\";
    HeadlessFileCounters before = HeadlessCounters();
    auto start = std::chrono::steady_clock::now();
    search(index, modsRoot, bar);
    Run run;
    run.seconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    run.counters.opens = HeadlessCounters().opens - before.opens;
    run.counters.listings = HeadlessCounters().listings - before.listings;
    run.barMoves = HeadlessControlOf(bar)->positionsSet;
    for (const MeshIndexEntry& e : index)
        run.flags +=
            std::string(1, '0' + e.meshFound) + char('0' + e.meshLiveFound) + char('0' + e.meshDeadFound);
    return run;
}

double Ratio(double plain, double fast) { return fast > 0 ? plain / fast : 0; }

}  // namespace

int main(int argc, char** argv) {
    Tree tree;
    tree.folder = argc > 1 ? argv[1] : (fs::temp_directory_path() / "verrant-mesh-bench").string();
    if (argc > 2) tree.entries = std::stoi(argv[2]);
    if (argc > 3) tree.mods = std::stoi(argv[3]);
    std::printf("tree: %d entries x 3 meshes, %d mods, in %s\n", tree.entries, tree.mods,
                tree.folder.c_str());
    std::fflush(stdout);
    GenerateTree(tree);

    Run fast = Measure(tree, SearchModMeshFolders);
    std::printf("search: %10.3f s %12lld opens %10lld listings\n", fast.seconds, fast.counters.opens,
                fast.counters.listings);
    std::fflush(stdout);
    Run plain = Measure(tree, SearchModMeshFoldersPlainly);
    std::printf("plain:  %10.3f s %12lld opens %10lld listings\n", plain.seconds, plain.counters.opens,
                plain.counters.listings);
    std::printf("ratio (plain / search): time %.1fx, opens %.1fx\n", Ratio(plain.seconds, fast.seconds),
                Ratio(static_cast<double>(plain.counters.opens), static_cast<double>(fast.counters.opens)));
    bool same = fast.flags == plain.flags && fast.barMoves == plain.barMoves;
    std::printf("same flags and bar moves: %s (%zu bar moves)\n", same ? "yes" : "NO", fast.barMoves.size());
    return same ? 0 : 1;
}
