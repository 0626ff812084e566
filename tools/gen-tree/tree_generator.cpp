// The generated tree imitates a modpack merged from hundreds of mods:
//
//   //------------------------------------------------------------
//   [***]
//   Title House
//   (0)
//   [buildings.House$Barn12]
//   Mesh          3do/Buildings/Barn/Barn12/mono.sim
//   ...
//   [***]
//   Title Harbour Objects M042
//   // Harbour Objects M042: 17 objects
//   [buildings.House$Pier_M042_3]
//   MeshLive      3do/Buildings/M042/pier_4_live.sim
//   MeshDead      3do/Buildings/M042/pier_4_dead.sim
//
// The game's own objects stand first under the standard titles; their meshes live in the game's
// archives, so no mod folder holds them. Each mod's objects follow under its own title, sharing a
// pool of meshes of which most, not all, lie in the mod's 3do folder.
#include "tree_generator.h"

#include "checks/mesh_references.h"
#include "map_records.h"

#include <algorithm>
#include <cmath>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <set>
#include <unordered_map>
#include <vector>

namespace fs = std::filesystem;

namespace {

// splitmix64: the same numbers from every compiler and library, unlike the std distributions.
struct Random {
    std::uint64_t state;
    std::uint64_t Next() {
        std::uint64_t z = (state += 0x9E3779B97F4A7C15ull);
        z = (z ^ (z >> 30)) * 0xBF58476D1CE4E5B9ull;
        z = (z ^ (z >> 27)) * 0x94D049BB133111EBull;
        return z ^ (z >> 31);
    }
    int Below(int n) { return n <= 1 ? 0 : static_cast<int>(Next() % static_cast<std::uint64_t>(n)); }
    double Unit() { return static_cast<double>(Next() >> 11) / 9007199254740992.0; }
    bool Chance(double p) { return Unit() < p; }
    template <typename T, std::size_t N> const T& Pick(const T (&items)[N]) { return items[Below(N)]; }
};

const char* const Words[] = {"Barn",    "Shed",   "Kiosk",    "Pier",     "Hangar",  "Tower",   "Church",
                             "Bunker",  "Tent",   "Wall",     "Fence",    "Bridge",  "Crane",   "Tank",
                             "Depot",   "Silo",   "Hut",      "Mill",     "Station", "Chapel",  "Well",
                             "Sauna",   "Garage", "Factory",  "Farm",     "Castle",  "Ruin",    "Dock",
                             "Radar",   "Flak",   "Barracks", "Boathouse", "Lighthouse", "Warehouse"};
const char* const Themes[] = {"Harbour", "Airfield", "Village", "Desert", "Winter", "Jungle", "Industry",
                              "Railway", "Coastal", "Urban",    "Pacific", "Steppe", "Alpine", "Island"};
const char* const Bodies[] = {"Wood", "Concrete", "Steel", "Brick", "Stone", "Glass"};

struct Family {
    const char* name;     // in the header, after "buildings."
    const char* folder;   // under 3do
    double share;
};
// The four families the irregular-entries check knows, and three it does not.
const Family Families[] = {{"House", "Buildings", 0.76},  {"Furniture", "Furniture", 0.10},
                           {"Plate", "Plates", 0.08},     {"Mountain", "Mountains", 0.04},
                           {"Tree", "Trees", 0.008},      {"Bridge", "Bridges", 0.007},
                           {"Wreck", "Wrecks", 0.005}};

const Family& PickFamily(Random& random) {
    double u = random.Unit();
    for (const Family& family : Families) {
        if (u < family.share) return family;
        u -= family.share;
    }
    return Families[0];
}

struct Mod {
    std::string folder;     // under mods
    std::string tag;        // "M042"
    std::string title;      // the title line of its group
    std::string meshFolder; // "3do", "3DO", or "" for a mod without meshes
    std::string lineEnd;
    bool numbered = false;
    int objectCount = 0;
    std::vector<std::string> meshPool;  // base names its objects share
};

// One unit of the catalogue: a group opener or an object's section, as lines without their ends.
struct Block {
    std::vector<std::string> lines;
    std::string lineEnd;
    bool isObject = false;
};

struct Plan {
    std::vector<Mod> mods;
    std::vector<Block> blocks;
    std::vector<std::string> sectionNames;   // each defined object once, for the maps
    std::set<std::string> meshFiles;         // paths under mods, "/" separated
    int doubledHeaders = 0;
};

const std::string CrLf = "\r\n";

std::string KeyLine(const std::string& key, const std::string& value) {
    std::string line = key;
    line.append(key.size() < 14 ? 14 - key.size() : 1, ' ');
    return line + value;
}

// How a catalogue writes a mesh path: mostly as the mod wrote it, sometimes with other separators
// or a relative prefix, as merged files tend to.
std::string WrittenMeshPath(Random& random, const std::string& path) {
    double u = random.Unit();
    if (u < 0.05) {
        std::string back = path;
        std::replace(back.begin(), back.end(), '/', '\\');
        return back;
    }
    if (u < 0.07) return "../3DO" + path.substr(3);
    if (u < 0.08) return "3DO" + path.substr(3);
    return path;
}

void PlanMods(const TreeShape& shape, Random& random, int modObjects, Plan& plan) {
    std::vector<double> weights;
    double total = 0;
    for (int m = 0; m < shape.mods; ++m) {
        double u = random.Unit();
        weights.push_back(0.2 + 10 * u * u * u);  // a few big packs, many small mods
        total += weights.back();
    }
    int assigned = 0;
    for (int m = 0; m < shape.mods; ++m) {
        Mod mod;
        char tag[16];
        std::snprintf(tag, sizeof tag, "M%03d", m);
        mod.tag = tag;
        std::string theme = random.Pick(Themes);
        mod.folder = mod.tag + "_" + theme + "Pack";
        mod.title = "Title " + theme + " Objects " + mod.tag;
        mod.meshFolder = random.Chance(0.05) ? "" : (m % 25 == 7 ? "3DO" : "3do");
        double ending = random.Unit();
        mod.lineEnd = ending < 0.88 ? "\r\n" : ending < 0.98 ? "\n" : "\r";
        mod.numbered = random.Chance(0.4);
        mod.objectCount = static_cast<int>(modObjects * weights[m] / total);
        assigned += mod.objectCount;
        plan.mods.push_back(mod);
    }
    for (int m = 0; assigned < modObjects; m = (m + 1) % std::max(1, shape.mods), ++assigned)
        ++plan.mods[m].objectCount;
    for (Mod& mod : plan.mods) {
        int poolSize = std::max(2, mod.objectCount / 4);
        for (int k = 0; k < poolSize; ++k)
            mod.meshPool.push_back(std::string(random.Pick(Words)) + "_" + std::to_string(k));
    }
}

// Where a mesh file of this mod lies on disk: its own mesh folder, or now and then (always, for a
// mod without one) the mesh folder of another mod that serves as a shared pack.
std::string MeshFileHome(Random& random, const Plan& plan, const Mod& mod) {
    if (random.Chance(0.002)) return "3do";  // the mesh folder right under mods
    if (!mod.meshFolder.empty() && !random.Chance(0.03)) return mod.folder + "/" + mod.meshFolder;
    for (int tries = 0; tries < 20; ++tries) {
        const Mod& other = plan.mods[random.Below(static_cast<int>(plan.mods.size()))];
        if (!other.meshFolder.empty()) return other.folder + "/" + other.meshFolder;
    }
    return "";
}

struct Planner {
    const TreeShape& shape;
    Random random;
    Plan plan;
    std::unordered_map<std::string, bool> meshDecided;  // mesh path -> lies on disk
    std::vector<std::pair<std::string, std::string>> defined;  // family, name of earlier objects
    int ordinal = 0;
    int groups = 0;

    // A mesh value for an object of mod (or of the game, mod == nullptr), deciding once per path
    // whether some mesh folder holds the file.
    std::string MeshValue(const Mod* mod, const Family& family, const std::string& base, const char* suffix) {
        std::string path;
        if (!mod) return std::string("3do/") + family.folder + "/" + base + "/" + suffix + ".sim";
        path = std::string("3do/") + family.folder + "/" + mod->tag + "/" + base + "_" + suffix + ".sim";
        auto [it, fresh] = meshDecided.try_emplace(path, false);
        if (fresh && random.Chance(0.92)) {
            std::string home = MeshFileHome(random, plan, *mod);
            if (!home.empty()) {
                plan.meshFiles.insert(home + path.substr(3));
                it->second = true;
            }
        }
        // One mod keeps some of its missing meshes in a stale copy that the search passes over.
        if (fresh && !it->second && mod->tag == "M011") plan.meshFiles.insert(mod->folder + "/3do_old" + path.substr(3));
        return WrittenMeshPath(random, path);
    }

    void AddGroup(const std::string& title, const std::string& lineEnd, bool withComments) {
        Block block;
        block.lineEnd = lineEnd;
        if (withComments) {
            block.lines.push_back("/--------------------------------------------------------------");
            block.lines.push_back("// " + title.substr(title.find(' ') + 1));
        }
        block.lines.push_back("[***]");
        // Now and then a title carries blanks that trimming removes.
        block.lines.push_back(random.Chance(0.02) && groups > 0 ? title + "  " : title);
        ++groups;
        plan.blocks.push_back(block);
    }

    void AddObject(const Mod* mod) {
        Block block;
        block.lineEnd = mod ? mod->lineEnd : CrLf;
        block.isObject = true;
        const Family* family = &PickFamily(random);
        std::string name;
        bool doubled = mod && !defined.empty() && random.Chance(0.01);
        if (doubled) {
            const auto& earlier = defined[random.Below(static_cast<int>(defined.size()))];
            for (const Family& f : Families)
                if (earlier.first == f.name) family = &f;
            name = earlier.second;
            ++plan.doubledHeaders;
        } else {
            std::string word = random.Pick(Words);
            if (std::string(family->name) == "Mountain" && random.Chance(0.1)) word = "Suribachi";
            else if (random.Chance(0.005)) word = "Kust";
            else if (std::string(family->name) == "Plate") word += "Plate";
            name = word + (mod ? "_" + mod->tag + "_" : "") + std::to_string(ordinal);
            defined.push_back({family->name, name});
            plan.sectionNames.push_back(std::string("buildings.") + family->name + "$" + name);
        }
        bool numbered = mod ? mod->numbered : true;
        if (numbered) block.lines.push_back("(" + std::to_string(ordinal) + ")");
        std::string header = std::string("[buildings.") + family->name + "$" + name + "]";
        double variant = random.Unit();
        if (variant < 0.01) header += " // " + std::string(random.Pick(Themes)) + " pack";
        else if (variant < 0.015) header = "  " + header;
        block.lines.push_back(header);
        ++ordinal;

        std::string base = mod ? mod->meshPool[random.Below(static_cast<int>(mod->meshPool.size()))]
                               : std::string(random.Pick(Words)) + std::to_string(ordinal);
        double meshKind = random.Unit();
        if (meshKind < 0.002) {
            block.lines.push_back("Mesh");
        } else if (meshKind < 0.003) {
            block.lines.push_back("MeshLive   ");
            block.lines.push_back(KeyLine("MeshDead", MeshValue(mod, *family, base, "dead")));
        } else if (meshKind < 0.004) {
            block.lines.push_back(KeyLine("MeshLive", MeshValue(mod, *family, base, "live")));
            block.lines.push_back("MeshDead");
        } else if (meshKind < 0.60) {
            block.lines.push_back(KeyLine("Mesh", MeshValue(mod, *family, base, "mono")));
        } else {
            std::string live = MeshValue(mod, *family, base, "live");
            block.lines.push_back(KeyLine("MeshLive", live));
            // A few objects use one mesh for both states.
            block.lines.push_back(KeyLine("MeshDead", random.Chance(0.02) ? live : MeshValue(mod, *family, base, "dead")));
        }
        if (random.Chance(0.3)) block.lines.push_back(KeyLine("Body", random.Pick(Bodies)));
        if (random.Chance(0.3)) block.lines.push_back(KeyLine("Panzer", "0." + std::to_string(1 + random.Below(9))));
        if (random.Chance(0.1)) block.lines.push_back(KeyLine("AlignToLand", "1"));
        if (random.Chance(0.05)) block.lines.push_back(KeyLine("AddHeightLive", "0.5"));
        if (random.Chance(0.03)) block.lines.push_back(KeyLine("AddHeightDead", "-0.5"));
        if (random.Chance(0.03)) block.lines.push_back(KeyLine("PAlign", "1"));
        if (random.Chance(0.02)) block.lines.push_back(KeyLine("equals", "buildings.House$" + base));
        if (random.Chance(0.01)) block.lines.push_back(KeyLine("Ignore", "1"));
        // Lines the irregular-entries check reports.
        if (random.Chance(0.005)) block.lines.push_back(KeyLine("mesh", "3do/Buildings/" + base + "/mono.sim"));
        if (random.Chance(0.003)) block.lines.push_back(KeyLine("Colour", "white"));
        if (random.Chance(0.002)) block.lines.push_back("\tIgnore      1");
        if (random.Chance(0.0005)) block.lines.push_back("[Buildings.House$" + name + "_old]");
        // Other section headers open no entry; their keys count for the object before them.
        if (random.Chance(0.001)) {
            block.lines.push_back(random.Chance(0.5) ? "[_Lights]" : "[airdrome.Lights]");
            block.lines.push_back(KeyLine("Body", "Glass"));
        }
        if (random.Chance(0.05)) block.lines.push_back("// " + std::string(random.Pick(Themes)) + " variant");
        plan.blocks.push_back(block);
    }
};

Plan MakePlan(const TreeShape& shape) {
    Planner planner{shape, Random{shape.seed}, Plan(), {}, {}, 0, 0};
    int objects = std::max(0, shape.objects);
    int preamble = std::min(objects, 2);
    int standard = std::min(objects - preamble, objects / 5);
    int modObjects = objects - preamble - standard;
    if (shape.mods <= 0) {
        standard += modObjects;
        modObjects = 0;
    }
    PlanMods(shape, planner.random, modObjects, planner.plan);

    Block heading;
    heading.lineEnd = CrLf;
    heading.lines = {"//------------------------------------------------------------",
                     "// static.ini of a merged modpack", "//------------------------------------------------------------"};
    planner.plan.blocks.push_back(heading);
    for (int i = 0; i < preamble; ++i) planner.AddObject(nullptr);
    const int titles = static_cast<int>(StandardTitles.size());
    for (int t = 0; t < titles; ++t) {
        int count = standard / titles + (t < standard % titles ? 1 : 0);
        planner.AddGroup(StandardTitles[t], CrLf, false);
        for (int i = 0; i < count; ++i) planner.AddObject(nullptr);
    }
    for (const Mod& mod : planner.plan.mods) {
        if (mod.objectCount == 0) continue;
        // Some mods add to a standard group, some split their objects over two groups.
        bool intoStandard = planner.random.Chance(0.05);
        planner.AddGroup(intoStandard ? StandardTitles[planner.random.Below(titles)] : mod.title,
                         mod.lineEnd, true);
        int split = planner.random.Chance(0.2) ? mod.objectCount / 2 : -1;
        for (int i = 0; i < mod.objectCount; ++i) {
            if (i == split) planner.AddGroup(mod.title, mod.lineEnd, false);
            planner.AddObject(&mod);
        }
    }
    return planner.plan;
}

const char* const FillerComments[] = {"// reworked collision", "// see readme of the pack", "// winter textures",
                                      "// TODO damage model", "/----------------------------------------"};

std::string FillerLine(Random& random) {
    double u = random.Unit();
    if (u < 0.35) return "";
    if (u < 0.38) return "   ";
    if (u < 0.70) return random.Pick(FillerComments);
    if (u < 0.85) return KeyLine("Panzer", "0." + std::to_string(random.Below(10)));
    return KeyLine("Body", random.Pick(Bodies));
}

std::string RenderCatalogue(const TreeShape& shape, const Plan& plan) {
    long long baseLines = 0;
    int objectBlocks = 0;
    for (const Block& block : plan.blocks) {
        baseLines += static_cast<long long>(block.lines.size());
        objectBlocks += block.isObject ? 1 : 0;
    }
    long long target = shape.lines > 0 ? shape.lines : 20LL * std::max(0, shape.objects);
    long long filler = std::max(0LL, target - baseLines);
    Random random{shape.seed ^ 0x5EEDF111ull};
    std::string text;
    text.reserve(static_cast<std::size_t>(target) * 24);
    int seen = 0;
    for (const Block& block : plan.blocks) {
        for (const std::string& line : block.lines) text += line + block.lineEnd;
        if (!block.isObject || objectBlocks == 0) continue;
        long long extra = filler / objectBlocks + (seen++ < filler % objectBlocks ? 1 : 0);
        for (long long i = 0; i < extra; ++i) text += FillerLine(random) + block.lineEnd;
    }
    if (objectBlocks == 0)
        for (long long i = 0; i < filler; ++i) text += FillerLine(random) + CrLf;
    return text;
}

bool WriteFileBytes(const fs::path& path, const std::string& bytes) {
    std::ofstream out(path, std::ios::binary | std::ios::trunc);
    out.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    return static_cast<bool>(out.flush());
}

// Placed class names: the game's objects most, popular ones often, and a few from a mod that is
// no longer installed.
std::vector<std::string> PlacedClassNames(const Plan& plan, int count, Random& random) {
    std::vector<std::string> names;
    names.reserve(static_cast<std::size_t>(std::max(0, count)));
    int defined = static_cast<int>(plan.sectionNames.size());
    for (int i = 0; i < count; ++i) {
        std::string section;
        if (defined == 0 || random.Chance(0.02)) {
            section = "buildings.House$Gone_" + std::to_string(random.Below(500));
        } else {
            double u = random.Unit();
            section = plan.sectionNames[static_cast<std::size_t>(defined * u * u)];
        }
        names.push_back("com.maddox.il2.objects." + section);
    }
    return names;
}

}  // namespace

std::string GenerateCatalogue(const TreeShape& shape) { return RenderCatalogue(shape, MakePlan(shape)); }

std::string TreeShapeText(const TreeShape& shape) {
    return "seed " + std::to_string(shape.seed) + "\nobjects " + std::to_string(shape.objects) + "\nmods " +
           std::to_string(shape.mods) + "\nmaps " + std::to_string(shape.maps) + "\nmap-names " +
           std::to_string(shape.mapNames) + "\nlines " + std::to_string(shape.lines) + "\n";
}

bool WriteGeneratedTree(const TreeShape& shape, const std::string& outFolder, TreeSummary& summary,
                        std::string& error) {
    summary = TreeSummary();
    fs::path out(outFolder);
    std::error_code fsError;
    if (fs::exists(out, fsError) && !fs::is_empty(out, fsError) && !fs::exists(out / "gen-tree.txt", fsError)) {
        error = outFolder + " is not empty and was not written by gen-tree";
        return false;
    }
    fs::remove(out / "gen-tree.txt", fsError);
    fs::remove_all(out / "mods", fsError);

    Plan plan = MakePlan(shape);
    std::string catalogue = RenderCatalogue(shape, plan);
    summary.catalogueBytes = static_cast<long long>(catalogue.size());
    // Lines as the reader counts them: every line end but a CR that an LF follows.
    for (std::size_t i = 0; i < catalogue.size(); ++i)
        if (catalogue[i] == '\n' || (catalogue[i] == '\r' && (i + 1 == catalogue.size() || catalogue[i + 1] != '\n')))
            ++summary.catalogueLines;
    summary.doubledHeaders = plan.doubledHeaders;

    std::set<fs::path> folders;
    auto makeFolder = [&](const fs::path& folder) {
        if (folders.insert(folder).second) fs::create_directories(folder, fsError);
        return !fsError;
    };
    fs::path objects = out / "mods/std/com/maddox/il2/objects";
    if (!makeFolder(objects) || !WriteFileBytes(objects / "static.ini", catalogue)) {
        error = "cannot write " + (objects / "static.ini").string();
        return false;
    }
    for (const Mod& mod : plan.mods) makeFolder(out / "mods" / mod.folder);
    for (const std::string& file : plan.meshFiles) {
        fs::path path = out / "mods" / file;
        if (!makeFolder(path.parent_path()) || !WriteFileBytes(path, "")) {
            error = "cannot write " + path.string();
            return false;
        }
        ++summary.meshFiles;
    }
    Random random{shape.seed ^ 0x3A95ull};
    for (int m = 0; m < shape.maps; ++m) {
        fs::path map = out / "mods/mapmods/maps" / ("Map" + std::to_string(m + 1));
        std::string bytes = MapRecordBytes(PlacedClassNames(plan, shape.mapNames, random));
        if (!makeFolder(map) || !WriteFileBytes(map / "actors.static", bytes)) {
            error = "cannot write " + (map / "actors.static").string();
            return false;
        }
        summary.mapBytes += static_cast<long long>(bytes.size());
    }
    summary.folders = static_cast<int>(folders.size());
    if (!WriteFileBytes(out / "gen-tree.txt", TreeShapeText(shape))) {
        error = "cannot write " + (out / "gen-tree.txt").string();
        return false;
    }
    return true;
}
