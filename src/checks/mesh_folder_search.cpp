// Opening every mesh once per searched folder costs millions of opens on a big tree, nearly all of
// them failing. Instead the mesh paths are laid out as a tree of lowered names, and each searched
// folder is walked along that tree, one listing per folder that both the disk and some path hold.
// A file is only opened when the listing shows it, and it must open to count; a mesh stops being
// looked for once it is found.
#include "checks/mesh_folder_search.h"

#include "catalogue/text.h"
#include "output/app_state.h"
#include "output/messages.h"
#include "output/progress_list.h"

#include <string_view>
#include <unordered_map>

namespace {

struct MeshRef {
    std::size_t entry = 0;
    const MeshSlot* slot = nullptr;
};

// One mesh value, as written, with every index field that names it.
struct MeshFile {
    std::string value;
    std::vector<MeshRef> refs;
    int node = -1;  // the folder node that holds it; -1 when no listing can judge its path
    bool found = false;
};

struct PathNode {
    int parent = -1;
    int pending = 0;                                          // files below not yet found
    std::unordered_map<std::string, int> folders;             // lowered name -> node
    std::unordered_map<std::string, std::vector<int>> files;  // lowered name -> files
};

struct MeshPathPlan {
    std::vector<PathNode> nodes;  // node 0 is the mod folder itself
    std::vector<MeshFile> files;
    std::vector<int> unjudged;  // opened in every searched folder until found
};

// Whether a listing can show that the name is absent. Windows opens other spellings of these: the
// empty name of a doubled "\", "." and "..", trailing dots and blanks, short names, streams,
// wildcards, and letters beyond ASCII whose case it folds.
bool ListingDecides(const std::string& name) {
    const std::string_view unlisted = "~:*?\"<>|";
    if (name.empty() || name.back() == '.' || name.back() == ' ') return false;
    for (char c : name)
        if (static_cast<unsigned char>(c) >= 0x80 || unlisted.find(c) != std::string_view::npos) return false;
    return true;
}

std::vector<std::string> SplitPath(const std::string& value) {
    std::vector<std::string> names;
    std::size_t start = 0;
    for (;;) {
        std::size_t slash = value.find('\\', start);
        names.push_back(value.substr(start, slash == std::string::npos ? std::string::npos : slash - start));
        if (slash == std::string::npos) return names;
        start = slash + 1;
    }
}

int ChildFolder(MeshPathPlan& plan, int node, const std::string& lowered) {
    auto found = plan.nodes[node].folders.find(lowered);
    if (found != plan.nodes[node].folders.end()) return found->second;
    int child = static_cast<int>(plan.nodes.size());
    plan.nodes[node].folders.emplace(lowered, child);
    plan.nodes.emplace_back();
    plan.nodes[child].parent = node;
    return child;
}

void PlaceFile(MeshPathPlan& plan, int fileIndex) {
    std::vector<std::string> names = SplitPath(plan.files[fileIndex].value);
    for (const std::string& name : names) {
        if (ListingDecides(name)) continue;
        plan.unjudged.push_back(fileIndex);
        return;
    }
    int node = 0;
    for (std::size_t i = 0; i + 1 < names.size(); ++i) node = ChildFolder(plan, node, LowerCopy(names[i]));
    plan.nodes[node].files[LowerCopy(names.back())].push_back(fileIndex);
    plan.files[fileIndex].node = node;
    for (int up = node; up >= 0; up = plan.nodes[up].parent) ++plan.nodes[up].pending;
}

// The set meshes not yet found of the entries that have a title, one file per distinct value.
MeshPathPlan PlanMeshPaths(const std::vector<MeshIndexEntry>& index) {
    MeshPathPlan plan;
    plan.nodes.emplace_back();
    std::unordered_map<std::string, int> fileOfValue;
    for (std::size_t entry = 0; entry < index.size(); ++entry) {
        if (index[entry].title.empty()) continue;
        for (const MeshSlot& slot : MeshSlots) {
            std::string_view value = index[entry].*slot.value;
            // A value ending in "\" names a folder, never a mesh file.
            if (value.empty() || value.back() == '\\' || index[entry].*slot.found) continue;
            auto [it, added] = fileOfValue.try_emplace(std::string(value), static_cast<int>(plan.files.size()));
            if (added) plan.files.push_back({std::string(value), {}, -1, false});
            plan.files[it->second].refs.push_back({entry, &slot});
        }
    }
    for (int file = 0; file < static_cast<int>(plan.files.size()); ++file) PlaceFile(plan, file);
    return plan;
}

void TryFile(MeshPathPlan& plan, std::vector<MeshIndexEntry>& index, int fileIndex,
             const std::string& modFolder) {
    MeshFile& file = plan.files[fileIndex];
    if (file.found) return;
    Handle opened = OpenForReading(modFolder + file.value);
    if (opened == 0) return;
    CloseFile(opened);
    file.found = true;
    for (const MeshRef& ref : file.refs) index[ref.entry].*(ref.slot->found) = true;
    for (int up = file.node; up >= 0; up = plan.nodes[up].parent) --plan.nodes[up].pending;
}

// folder ends in "\" and is listed in entries; it stands for the node.
void WalkFolder(MeshPathPlan& plan, std::vector<MeshIndexEntry>& index, int node, const std::string& folder,
                const std::vector<FolderEntry>& entries, const std::string& modFolder) {
    for (const FolderEntry& entry : entries) {
        if (plan.nodes[node].pending == 0) return;
        std::string lowered = LowerCopy(entry.name);
        if (!entry.isFolder) {
            auto files = plan.nodes[node].files.find(lowered);
            if (files == plan.nodes[node].files.end()) continue;
            for (int file : files->second) TryFile(plan, index, file, modFolder);
            continue;
        }
        auto child = plan.nodes[node].folders.find(lowered);
        if (child == plan.nodes[node].folders.end() || plan.nodes[child->second].pending == 0) continue;
        std::string below = folder + entry.name + "\\";
        std::vector<FolderEntry> belowEntries;
        if (ListFolder(below + "*.*", belowEntries))
            WalkFolder(plan, index, child->second, below, belowEntries, modFolder);
    }
}

}  // namespace

std::string ShownModsRoot(const std::string& modsRoot) {
    std::size_t mods = LowerCopy(modsRoot).find("mods");
    return "...\\" + modsRoot.substr(mods == std::string::npos ? 0 : mods);
}

void CountVisits(VisitCounter& counter, std::size_t visits, Handle bar) {
    const int moveAt = 5000;
    while (visits >= static_cast<std::size_t>(moveAt - counter.visits)) {
        visits -= static_cast<std::size_t>(moveAt - counter.visits);
        counter.barPosition = counter.barPosition == 35 ? 1 : counter.barPosition + 1;
        SetProgressBarPosition(bar, counter.barPosition);
        counter.visits = 1;
    }
    counter.visits += static_cast<int>(visits);
}

void SearchModMeshFolders(std::vector<MeshIndexEntry>& index, const std::string& modsRoot, Handle bar) {
    MeshPathPlan plan = PlanMeshPaths(index);
    const std::string shown = ShownModsRoot(modsRoot);
    VisitCounter counter;
    std::vector<FolderEntry> mods;
    if (!ListFolder(modsRoot + "*.*", mods)) return;
    std::vector<FolderEntry> inMod;
    for (const FolderEntry& mod : mods) {
        DrainPendingEvents();
        if (!mod.isFolder) continue;
        const std::string modFolder = modsRoot + mod.name + "\\";
        if (!ListFolder(modFolder + "*.*", inMod)) continue;
        for (const FolderEntry& meshFolder : inMod) {
            if (!meshFolder.isFolder || LowerCopy(meshFolder.name) != "3do") continue;
            DrainPendingEvents();
            if (ProgressListOn) AddProgressLine("Check: " + shown + mod.name + "\\3do");
            for (int file : plan.unjudged) TryFile(plan, index, file, modFolder);
            WalkFolder(plan, index, 0, modFolder, inMod, modFolder);
            CountVisits(counter, index.size(), bar);
        }
    }
}
