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

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <iterator>
#include <string_view>
#include <unordered_map>

namespace {

constexpr std::uint64_t EveryByte = 0x0101010101010101ull;
constexpr std::uint64_t HighBits = 0x8080808080808080ull;

// Up to eight bytes as one word, zero beyond the end.
std::uint64_t Word(const char* bytes, std::size_t size) {
    std::uint64_t word = 0;
    std::memcpy(&word, bytes, std::min<std::size_t>(size, 8));
    return word;
}

// Eight bytes lowered at once: "A" to "Z" only, as the names are compared.
std::uint64_t LowerWord(std::uint64_t word) {
    const std::uint64_t low = word & ~HighBits;
    const std::uint64_t fromA = low + EveryByte * (0x80 - 'A');
    const std::uint64_t pastZ = low + EveryByte * (0x80 - 'Z' - 1);
    return word | ((fromA & ~pastZ & ~word & HighBits) >> 2);
}

// Open addressing over (owner, name), names compared without regard to ASCII letter case and without
// lowered copies, so a listed name is looked up as the system gives it. The names point into the
// index, which outlives the search; nothing is ever removed.
class NameTable {
   public:
    void Reserve(std::size_t count) {
        std::size_t size = 16;
        while (size < count * 2) size *= 2;
        slots_.assign(size, Slot{});
        used_ = 0;
    }

    static std::uint32_t Hash(int owner, std::string_view name) {
        std::uint64_t hash =
            (static_cast<std::uint64_t>(static_cast<std::uint32_t>(owner)) << 32) ^ name.size();
        for (std::size_t at = 0; at < name.size(); at += 8) {
            hash = (hash << 5 | hash >> 59) ^ LowerWord(Word(name.data() + at, name.size() - at));
            hash *= 0x9E3779B97F4A7C15ull;
        }
        hash *= 0x9E3779B97F4A7C15ull;
        return static_cast<std::uint32_t>(hash >> 32);
    }

    // Starts fetching the slot a lookup of the hash begins at.
    void Prefetch(std::uint32_t hash) const { __builtin_prefetch(&slots_[hash & Mask()]); }

    // The value under the key of the hash, or -1.
    int Find(int owner, std::string_view name, std::uint32_t hash) const {
        for (std::size_t i = hash & Mask();; i = (i + 1) & Mask()) {
            const Slot& slot = slots_[i];
            if (slot.value < 0) return -1;
            if (slot.hash == hash && Same(slot, owner, name)) return slot.value;
        }
    }

    // The value under the key, set to value first when the key is new.
    int& FindOrAdd(int owner, std::string_view name, int value) {
        if ((used_ + 1) * 2 > slots_.size()) Grow();
        return FindOrAdd(owner, name, value, Hash(owner, name));
    }

   private:
    int& FindOrAdd(int owner, std::string_view name, int value, std::uint32_t hash) {
        for (std::size_t i = hash & Mask();; i = (i + 1) & Mask()) {
            Slot& slot = slots_[i];
            if (slot.value < 0) {
                slot = {name.data(), static_cast<std::uint32_t>(name.size()), hash, owner, value};
                ++used_;
                return slot.value;
            }
            if (slot.hash == hash && Same(slot, owner, name)) return slot.value;
        }
    }

    struct Slot {
        const char* name = nullptr;
        std::uint32_t size = 0;
        std::uint32_t hash = 0;
        int owner = 0;
        int value = -1;  // -1: empty
    };

    std::size_t Mask() const { return slots_.size() - 1; }

    static bool Same(const Slot& slot, int owner, std::string_view name) {
        if (slot.owner != owner || slot.size != name.size()) return false;
        for (std::size_t at = 0; at < name.size(); at += 8)
            if (LowerWord(Word(slot.name + at, name.size() - at)) !=
                LowerWord(Word(name.data() + at, name.size() - at)))
                return false;
        return true;
    }

    void Grow() {
        std::vector<Slot> old;
        old.swap(slots_);
        Reserve(std::max<std::size_t>(old.size(), 16));
        for (const Slot& slot : old)
            if (slot.value >= 0)
                FindOrAdd(slot.owner, std::string_view(slot.name, slot.size), slot.value, slot.hash);
    }

    std::vector<Slot> slots_ = std::vector<Slot>(16);
    std::size_t used_ = 0;
};

// One mesh value, as written.
struct MeshFile {
    std::string_view value;
    int node = -1;      // the folder node that holds it; -1 when no listing can judge its path
    int sameName = -1;  // the next file of the node whose name is the same in lowered form
    bool found = false;
};

// An index field that names a file, in the order of the index.
struct MeshRef {
    std::size_t entry = 0;
    const MeshSlot* slot = nullptr;
    int file = 0;
};

struct PathNode {
    int parent = -1;
    int pending = 0;  // files below not yet found
};

// Owners in the name table: a folder's subfolders are under its node, its files under FilesOf(node),
// and a whole folder path as written under FolderPaths, so that the parts of a path that is known
// already need no lookup each.
int FilesOf(int node) { return -2 - node; }
const int FolderPaths = -1;

struct MeshPathPlan {
    std::vector<PathNode> nodes;  // node 0 is the mod folder itself
    std::vector<MeshFile> files;
    std::vector<MeshRef> refs;
    NameTable names;
    std::vector<int> unjudged;    // opened in every searched folder until found
    std::string path;             // the path opened last, kept for its capacity
    std::string_view lastFolder;  // the folder of the value placed last and its node: an entry's
    int lastFolderNode = 0;       // meshes mostly share one
};

// Whether a listing can show that the name is absent. Windows opens other spellings of these: the
// empty name of a doubled "\", "." and "..", trailing dots and blanks, short names, streams,
// wildcards, and letters beyond ASCII whose case it folds.
bool ListingDecides(std::string_view name) {
    if (name.empty() || name.back() == '.' || name.back() == ' ') return false;
    for (char c : name) {
        switch (c) {
            case '~':
            case ':':
            case '*':
            case '?':
            case '"':
            case '<':
            case '>':
            case '|':
                return false;
            default:
                if (static_cast<unsigned char>(c) >= 0x80) return false;
        }
    }
    return true;
}

bool PathListingDecides(std::string_view value) {
    for (std::size_t start = 0;;) {
        std::size_t slash = value.find('\\', start);
        if (!ListingDecides(value.substr(start, slash == std::string_view::npos ? slash : slash - start)))
            return false;
        if (slash == std::string_view::npos) return true;
        start = slash + 1;
    }
}

// The node of a folder path ("" for the mod folder), made part by part when it is new.
int FolderNode(MeshPathPlan& plan, std::string_view folder) {
    if (folder.empty()) return 0;
    const int known = plan.names.Find(FolderPaths, folder, NameTable::Hash(FolderPaths, folder));
    if (known >= 0) return known;
    int node = 0;
    for (std::size_t start = 0; start <= folder.size();) {
        const std::size_t slash = std::min(folder.find('\\', start), folder.size());
        const int parent = node, child = static_cast<int>(plan.nodes.size());
        node = plan.names.FindOrAdd(parent, folder.substr(start, slash - start), child);
        if (node == child) plan.nodes.push_back({parent, 0});
        start = slash + 1;
    }
    return plan.names.FindOrAdd(FolderPaths, folder, node);
}

// The file of a value, made when it is new; values that are the same byte for byte share one.
int FileOf(MeshPathPlan& plan, std::string_view value,
           std::unordered_map<std::string_view, int>& unjudgedFiles) {
    const int added = static_cast<int>(plan.files.size());
    if (!PathListingDecides(value)) {
        auto [it, fresh] = unjudgedFiles.try_emplace(value, added);
        if (!fresh) return it->second;
        plan.files.push_back({value});
        plan.unjudged.push_back(added);
        return added;
    }
    const std::size_t slash = value.rfind('\\');
    const std::string_view folder = value.substr(0, slash == std::string_view::npos ? 0 : slash);
    if (folder != plan.lastFolder) {
        plan.lastFolder = folder;
        plan.lastFolderNode = FolderNode(plan, folder);
    }
    const int node = plan.lastFolderNode;
    const std::string_view name = value.substr(slash == std::string_view::npos ? 0 : slash + 1);
    int& first = plan.names.FindOrAdd(FilesOf(node), name, -1);
    for (int file = first; file >= 0; file = plan.files[file].sameName)
        if (plan.files[file].value == value) return file;
    plan.files.push_back({value, node, first});
    first = added;
    for (int up = node; up >= 0; up = plan.nodes[up].parent) ++plan.nodes[up].pending;
    return added;
}

// The set meshes not yet found of the entries that have a title.
void PlanMeshPaths(const std::vector<MeshIndexEntry>& index, MeshPathPlan& plan) {
    plan.nodes.push_back({});
    plan.names.Reserve(index.size() / 2);
    // Room for every field at once: only the pages written are ever touched, and nothing is moved.
    plan.refs.reserve(index.size() * std::size(MeshSlots));
    plan.files.reserve(index.size() * std::size(MeshSlots));
    std::unordered_map<std::string_view, int> unjudgedFiles;
    for (std::size_t entry = 0; entry < index.size(); ++entry) {
        if (index[entry].title.empty()) continue;
        for (const MeshSlot& slot : MeshSlots) {
            std::string_view value = index[entry].*slot.value;
            // A value ending in "\" names a folder, never a mesh file.
            if (value.empty() || value.back() == '\\' || index[entry].*slot.found) continue;
            plan.refs.push_back({entry, &slot, FileOf(plan, value, unjudgedFiles)});
        }
    }
}

// Found flags are set once the search is over, in the order of the index.
void MarkFound(const MeshPathPlan& plan, std::vector<MeshIndexEntry>& index) {
    for (const MeshRef& ref : plan.refs)
        if (plan.files[ref.file].found) index[ref.entry].*(ref.slot->found) = true;
}

void TryFile(MeshPathPlan& plan, int fileIndex, const std::string& modFolder) {
    MeshFile& file = plan.files[fileIndex];
    if (file.found) return;
    plan.path.assign(modFolder).append(file.value);
    Handle opened = OpenForReading(plan.path);
    if (opened == 0) return;
    CloseFile(opened);
    file.found = true;
    for (int up = file.node; up >= 0; up = plan.nodes[up].parent) --plan.nodes[up].pending;
}

// folder ends in "\" and is listed in entries; it stands for the node.
void WalkFolder(MeshPathPlan& plan, int node, std::string& folder, const std::vector<FolderEntry>& entries,
                const std::string& modFolder) {
    // The table slots of all the names are fetched together before the first is looked at.
    std::vector<std::uint32_t> hashes(entries.size());
    for (std::size_t i = 0; i < entries.size(); ++i) {
        hashes[i] = NameTable::Hash(entries[i].isFolder ? node : FilesOf(node), entries[i].name);
        plan.names.Prefetch(hashes[i]);
    }
    for (std::size_t i = 0; i < entries.size(); ++i) {
        const FolderEntry& entry = entries[i];
        if (plan.nodes[node].pending == 0) return;
        if (!entry.isFolder) {
            for (int file = plan.names.Find(FilesOf(node), entry.name, hashes[i]); file >= 0;
                 file = plan.files[file].sameName)
                TryFile(plan, file, modFolder);
            continue;
        }
        int child = plan.names.Find(node, entry.name, hashes[i]);
        if (child < 0 || plan.nodes[child].pending == 0) continue;
        const std::size_t length = folder.size();
        folder.append(entry.name).append("\\*.*");
        std::vector<FolderEntry> belowEntries;
        bool listed = ListFolder(folder, belowEntries);
        folder.resize(folder.size() - 3);
        if (listed) WalkFolder(plan, child, folder, belowEntries, modFolder);
        folder.resize(length);
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
    VisitCounter visits;
    SearchModMeshFolders(index, modsRoot, bar, visits, true);
}

void SearchModMeshFolders(std::vector<MeshIndexEntry>& index, const std::string& modsRoot, Handle bar,
                          VisitCounter& counter, bool showFolders) {
    MeshPathPlan plan;
    PlanMeshPaths(index, plan);
    const std::string shown = ShownModsRoot(modsRoot);
    std::vector<FolderEntry> mods;
    if (!ListFolder(modsRoot + "*.*", mods)) return;
    std::string folder;
    std::vector<FolderEntry> inMod;
    for (const FolderEntry& mod : mods) {
        DrainPendingEvents();
        if (!mod.isFolder) continue;
        const std::string modFolder = modsRoot + mod.name + "\\";
        if (!ListFolder(modFolder + "*.*", inMod)) continue;
        for (const FolderEntry& meshFolder : inMod) {
            if (!meshFolder.isFolder || LowerCopy(meshFolder.name) != "3do") continue;
            DrainPendingEvents();
            if (ProgressListOn && showFolders) AddProgressLine("Check: " + shown + mod.name + "\\3do");
            for (int file : plan.unjudged) TryFile(plan, file, modFolder);
            folder = modFolder;
            WalkFolder(plan, 0, folder, inMod, modFolder);
            CountVisits(counter, index.size(), bar);
        }
    }
    MarkFound(plan, index);
}
