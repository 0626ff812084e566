#include "maps/all_maps.h"

#include "catalogue/catalogue_reader.h"
#include "catalogue/name_table.h"
#include "catalogue/text.h"
#include "maps/map_file.h"
#include "output/app_state.h"
#include "output/catalogue_loading.h"
#include "output/messages.h"
#include "output/progress_list.h"
#include "output/reports.h"
#include "platform/platform.h"

#include <string_view>

namespace {

// A file named actors.static below the maps folder, and what the windows of catalogue names found
// of the names it places.
struct MapPlaces {
    std::string path;    // relative to the maps folder
    std::string folder;  // the file's folder and name, to read it again for every window
    std::string fileName;
    bool isMap = false;
    std::vector<bool> defined;  // per placed name: some window of the catalogue holds it
};

// Depth first, each folder in the order the listing gives (names by their upper case, as NTFS
// keeps them), so the paths come out in path order without regard to letter case.
void CollectMapFiles(const std::vector<FolderEntry>& entries, const std::string& folder,
                     const std::string& relative, std::vector<std::string>& mapFiles) {
    for (const FolderEntry& entry : entries) {
        if (entry.name == "." || entry.name == "..") continue;
        if (!entry.isFolder) {
            if (LowerCopy(entry.name) == "actors.static") mapFiles.push_back(relative + entry.name);
            continue;
        }
        std::vector<FolderEntry> inner;
        if (ListFolder(folder + entry.name + "\\*.*", inner))
            CollectMapFiles(inner, folder + entry.name + "\\", relative + entry.name + "\\", mapFiles);
    }
}

// A map lists a name it places many times once, at its first placement: a builder wants to know
// what to add, not how often it stands on the map.
std::vector<std::string> MissingNamesOnce(const std::vector<std::string>& mapNames,
                                          const std::vector<bool>& defined) {
    std::vector<std::string> missing;
    std::vector<std::string_view> seenNames;
    seenNames.reserve(mapNames.size());
    NameTable seen = NameTableFor(mapNames.size());
    for (std::size_t i = 0; i < mapNames.size(); ++i) {
        if (defined[i]) continue;
        int& slot = NameSlot(seen, seenNames, mapNames[i]);
        if (slot >= 0) continue;
        slot = static_cast<int>(seenNames.size());
        seenNames.push_back(mapNames[i]);
        missing.push_back(mapNames[i]);
    }
    return missing;
}

std::vector<MapPlaces> MapPlacesOf(const std::string& mapsFolder, const std::vector<std::string>& mapFiles) {
    std::vector<MapPlaces> maps;
    for (const std::string& path : mapFiles) {
        std::size_t slash = path.rfind('\\');
        MapPlaces map;
        map.path = path;
        map.folder = mapsFolder + path.substr(0, slash + 1);
        map.fileName = path.substr(slash + 1);
        map.isMap = IsMapFile(map.folder, map.fileName);
        maps.push_back(std::move(map));
    }
    return maps;
}

// Marks the placed names that one window of catalogue names holds.
void MarkDefinedNames(MapPlaces& map, const std::vector<std::string>& mapNames, const HeldNames& window,
                      NameTable& held) {
    map.defined.resize(mapNames.size());
    for (std::size_t i = 0; i < mapNames.size(); ++i)
        if (!map.defined[i] && NameSlot(held, window.names, mapNames[i]) >= 0) map.defined[i] = true;
}

// The report with the last window: a block per map with missing names, in path order, then the
// files that are no maps. Only their paths are held until then.
CommandResult ReportMissingNames(std::vector<MapPlaces>& maps, const HeldNames& window, NameTable& held,
                                 AllMapsCount& count) {
    FindingsWriter report{{"Missing_objects_all_maps.txt", "Missing objects of all maps in your static.ini:",
                           "No missing objects found", "All maps objects found in your static.ini"}};
    std::vector<std::string> notMaps;
    for (MapPlaces& map : maps) {
        if (!map.isMap) {
            notMaps.push_back(map.path);
            if (ProgressListOn) AddProgressLine("Not a map file: " + map.path);
            continue;
        }
        ++count.maps;
        std::vector<std::string> mapNames = ExtractMapObjectNames(ReadMapFileText(map.folder, map.fileName));
        MarkDefinedNames(map, mapNames, window, held);
        std::vector<std::string> missing = MissingNamesOnce(mapNames, map.defined);
        if (ProgressListOn)
            AddProgressLine("Map: " + map.path + ": " + std::to_string(mapNames.size()) + " objects, " +
                            std::to_string(missing.size()) + " missing");
        if (missing.empty()) continue;
        ++count.mapsWithMissing;
        count.namesMissing += static_cast<int>(missing.size());
        // An empty line opens each block; the report's own follows its heading.
        if (report.findings > 0) AddFinding(report, "");
        AddFinding(report, "Map: " + map.path);
        for (const std::string& name : missing) AddFinding(report, name);
    }
    count.notMaps = static_cast<int>(notMaps.size());
    if (report.findings > 0 && !notMaps.empty()) AddFinding(report, "");
    for (const std::string& path : notMaps) AddFinding(report, "Not a map file: " + path);
    return FinishFindings(report, true);
}

}  // namespace

bool FindMapFiles(const std::string& mapsFolder, std::vector<std::string>& mapFiles) {
    mapFiles.clear();
    std::vector<FolderEntry> entries;
    if (!ListFolder(mapsFolder + "*.*", entries)) return false;
    CollectMapFiles(entries, mapsFolder, "", mapFiles);
    return true;
}

std::string AllMapsSummary(const AllMapsCount& count) {
    return std::to_string(count.maps) + " maps checked, " + std::to_string(count.mapsWithMissing) +
           " with missing objects, " + std::to_string(count.namesMissing) + " names missing, " +
           std::to_string(count.notMaps) + " not map files";
}

// The catalogue's names are held a window at a time and every map is read against each window; a
// catalogue whose names fit in one window is read once, and every map once.
CommandResult CheckAllMaps(const std::string& catalogueFolder, const std::string& mapsFolder,
                           AllMapsCount& count, NameWindow limits) {
    count = AllMapsCount();
    LineReader opened;
    if (!OpenCatalogue(catalogueFolder, opened, CantOpenCatalogue)) return CommandResult::Failed;
    CataloguePass openPass = PassesOver(catalogueFolder, opened);
    std::vector<MapPlaces> maps;
    for (long long first = 0;;) {
        LineReader catalogue;
        if (!openPass(catalogue)) {
            TellCatalogueFailure(FileRead::FailedPartway, {});
            return CommandResult::Failed;
        }
        SkipBuildingHeaders(catalogue, first);
        HeldNames window(limits);
        bool ended = true;
        ForEachBuildingSectionName(catalogue,
                                   [&](std::string_view name) { ended = ended && HoldName(window, name); });
        if (!ReadToTheEnd(catalogue)) return CommandResult::Failed;
        if (first == 0) {
            std::vector<std::string> mapFiles;
            if (!FindMapFiles(mapsFolder, mapFiles)) return CommandResult::Failed;
            maps = MapPlacesOf(mapsFolder, mapFiles);
        }
        NameTable held = FirstPlaces(window.names);
        if (ended) {
            if (ProgressListOn) ClearProgressList();
            return ReportMissingNames(maps, window, held, count);
        }
        for (MapPlaces& map : maps)
            if (map.isMap)
                MarkDefinedNames(map, ExtractMapObjectNames(ReadMapFileText(map.folder, map.fileName)), window,
                                 held);
        first += static_cast<long long>(window.names.size());
    }
}
