// Times the map check on a large tree and sets the indexed lookup against a walk from the first
// header for every name. Not run by the tests:
//
//   bench-missing-objects FOLDER    builds FOLDER/mods/... and leaves it there for verrant-cli
#include "map_records.h"
#include "catalogue/catalogue_reader.h"
#include "maps/map_file.h"
#include "maps/missing_map_objects.h"
#include "platform/headless/headless.h"
#include "output/app_state.h"

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>

namespace {

const int CatalogueHeaders = 100000;
const int PlacedNames = 200000;

// The best of five runs, in seconds.
template <typename Work>
double BestTime(Work work) {
    double best = 1e9;
    for (int run = 0; run < 5; ++run) {
        auto start = std::chrono::steady_clock::now();
        work();
        best =
            std::min(best, std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count());
    }
    return best;
}

void WriteFile(const std::filesystem::path& path, const std::string& bytes) {
    std::filesystem::create_directories(path.parent_path());
    std::ofstream(path, std::ios::binary) << bytes;
}

// Every fourth placed name is one the catalogue lacks; the others spread over the whole catalogue.
std::vector<std::string> PlacedClassNames() {
    std::vector<std::string> names;
    for (int i = 0; i < PlacedNames; ++i) {
        int object = static_cast<int>((i * 7919LL) % CatalogueHeaders);
        names.push_back(BuildingClassName((i % 4 == 3 ? "Lost" : "Obj") + std::to_string(object)));
    }
    return names;
}

std::string Catalogue() {
    std::string text = "[***]\r\nTitle Bench\r\n";
    for (int i = 0; i < CatalogueHeaders; ++i)
        text += "[buildings.House$Obj" + std::to_string(i) + "]\r\nMesh          3do/Bench/" +
                std::to_string(i) + "/mono.sim\r\n";
    return text;
}

std::vector<int> WalkedOrdinals(const std::vector<std::string>& names,
                                const std::vector<std::string_view>& sections) {
    std::vector<int> ordinals;
    for (const std::string& name : names) {
        int found = NotInCatalogue;
        for (std::size_t k = 0; k < sections.size(); ++k)
            if (sections[k] == name) {
                found = static_cast<int>(k);
                break;
            }
        ordinals.push_back(found);
    }
    return ordinals;
}

}  // namespace

int main(int argc, char** argv) {
    if (argc != 2) {
        std::fprintf(stderr, "usage: bench-missing-objects FOLDER\n");
        return 2;
    }
    std::filesystem::path tree = std::filesystem::absolute(argv[1]);
    std::filesystem::path catalogue = tree / "mods/std/com/maddox/il2/objects";
    std::filesystem::path map = tree / "mods/mapmods/maps/Bench/actors.static";
    WriteFile(catalogue / "static.ini", Catalogue());
    WriteFile(map, MapRecordBytes(PlacedClassNames()));
    std::filesystem::create_directories(tree / "reports");

    HeadlessReset();
    ClearAppState();
    HeadlessSetDesktopFolder(HeadlessProgramPath((tree / "reports").string()) + "\\");
    std::string catalogueFolder = HeadlessProgramPath(catalogue.string()) + "\\";
    std::string mapPath = HeadlessProgramPath(map.string());
    std::size_t slash = mapPath.rfind('\\');
    std::string mapFolder = mapPath.substr(0, slash + 1), mapName = mapPath.substr(slash + 1);

    double wholeCheck = BestTime([&] { FindMissingMapObjects(mapFolder + "*" + mapName, catalogueFolder); });

    std::vector<std::string> names = ExtractMapObjectNames(ReadMapFileText(mapFolder, mapName));
    std::ifstream catalogueFile(catalogue / "static.ini", std::ios::binary);
    std::string catalogueBytes((std::istreambuf_iterator<char>(catalogueFile)), std::istreambuf_iterator<char>());
    std::vector<std::string> sectionNames;
    LineReader catalogueLines = LinesOf(catalogueBytes);
    ForEachBuildingSectionName(catalogueLines, [&](std::string_view name) { sectionNames.emplace_back(name); });
    const std::vector<std::string_view> sections(sectionNames.begin(), sectionNames.end());
    // The lookup as the check makes it: the map's names in a table, the catalogue read past them.
    auto lookUp = [&catalogueBytes](const std::vector<std::string>& placed) {
        LineReader lines = LinesOf(catalogueBytes);
        return FirstSectionOrdinals(placed, lines);
    };
    std::vector<int> indexed, walked;
    double indexedLookup = BestTime([&] { indexed = lookUp(names); });
    double walkedLookup = BestTime([&] { walked = WalkedOrdinals(names, sections); });

    // Beyond the bytes the check reads: every placed name looked up, as a larger window would need.
    std::vector<std::string> allNames;
    for (const std::string& className : PlacedClassNames())
        allNames.push_back(className.substr(className.find("build")));
    double allIndexed = BestTime([&] { lookUp(allNames); });
    double allWalkedEstimate =
        walkedLookup / static_cast<double>(names.size()) * static_cast<double>(allNames.size());

    std::printf("map: %d placed names, %zu of them within the 140,000 bytes read; catalogue: %zu headers\n",
                PlacedNames, names.size(), sections.size());
    std::printf("whole check (map, catalogue, lookup, report): %.3f s\n", wholeCheck);
    std::printf("lookup of the %zu names: by index %.4f s, by walk %.4f s, ratio %.0f, same ordinals: %s\n",
                names.size(), indexedLookup, walkedLookup, walkedLookup / indexedLookup,
                indexed == walked ? "yes" : "NO");
    std::printf(
        "lookup of all %zu names: by index %.4f s, by walk about %.0f s (estimated), ratio about %.0f\n",
        allNames.size(), allIndexed, allWalkedEstimate, allWalkedEstimate / allIndexed);
    return indexed == walked ? 0 : 1;
}
