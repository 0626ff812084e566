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

struct MapFindings {
    std::string path;  // relative to the maps folder
    std::vector<std::string> missing;
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
std::vector<std::string> MissingNamesOnce(const std::vector<std::string>& mapNames, NameTable& defined,
                                          const std::vector<std::string_view>& sectionNames) {
    std::vector<std::string> missing;
    std::vector<std::string_view> seenNames;
    seenNames.reserve(mapNames.size());
    NameTable seen = NameTableFor(mapNames.size());
    for (const std::string& name : mapNames) {
        if (NameSlot(defined, sectionNames, name) >= 0) continue;
        int& slot = NameSlot(seen, seenNames, name);
        if (slot >= 0) continue;
        slot = static_cast<int>(seenNames.size());
        seenNames.push_back(name);
        missing.push_back(name);
    }
    return missing;
}

CommandResult WriteAllMapsReport(const std::vector<MapFindings>& maps,
                                 const std::vector<std::string>& notMaps) {
    ReportFile report;
    if (!CreateReport("Missing_objects_all_maps.txt", report)) return CommandResult::Failed;
    WriteReportLine(report, "Missing objects of all maps in your static.ini:");
    // An empty line opens each block: one per map, then the files that are no maps.
    for (const MapFindings& map : maps) {
        WriteReportLine(report, "");
        WriteReportLine(report, "Map: " + map.path);
        for (const std::string& name : map.missing) WriteReportLine(report, name);
    }
    if (!notMaps.empty()) WriteReportLine(report, "");
    for (const std::string& path : notMaps) WriteReportLine(report, "Not a map file: " + path);
    return FinishReport(report) ? CommandResult::Findings : CommandResult::Failed;
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

CommandResult CheckAllMaps(const std::string& catalogueFolder, const std::string& mapsFolder,
                           AllMapsCount& count) {
    count = AllMapsCount();
    LineReader catalogue;
    if (!OpenCatalogue(catalogueFolder, catalogue, CantOpenCatalogue)) return CommandResult::Failed;
    SectionNames sections;
    ReadSectionNames(catalogue, sections);
    if (!ReadToTheEnd(catalogue)) return CommandResult::Failed;
    std::vector<std::string> mapFiles;
    if (!FindMapFiles(mapsFolder, mapFiles)) return CommandResult::Failed;
    const std::vector<std::string_view>& sectionNames = sections.names;
    NameTable defined = NameTableFor(sectionNames.size());
    for (std::size_t i = 0; i < sectionNames.size(); ++i) {
        int& slot = NameSlot(defined, sectionNames, sectionNames[i]);
        if (slot < 0) slot = static_cast<int>(i);
    }
    if (ProgressListOn) ClearProgressList();

    std::vector<MapFindings> maps;
    std::vector<std::string> notMaps;
    for (const std::string& path : mapFiles) {
        std::size_t slash = path.rfind('\\');
        std::string folder = mapsFolder + path.substr(0, slash + 1), fileName = path.substr(slash + 1);
        if (!IsMapFile(folder, fileName)) {
            notMaps.push_back(path);
            if (ProgressListOn) AddProgressLine("Not a map file: " + path);
            continue;
        }
        ++count.maps;
        std::vector<std::string> mapNames = ExtractMapObjectNames(ReadMapFileText(folder, fileName));
        std::vector<std::string> missing = MissingNamesOnce(mapNames, defined, sectionNames);
        if (ProgressListOn)
            AddProgressLine("Map: " + path + ": " + std::to_string(mapNames.size()) + " objects, " +
                            std::to_string(missing.size()) + " missing");
        if (missing.empty()) continue;
        ++count.mapsWithMissing;
        count.namesMissing += static_cast<int>(missing.size());
        maps.push_back({path, std::move(missing)});
    }
    count.notMaps = static_cast<int>(notMaps.size());

    if (maps.empty() && notMaps.empty()) {
        ShowMessage("No missing objects found", "All maps objects found in your static.ini");
        return CommandResult::NothingFound;
    }
    return WriteAllMapsReport(maps, notMaps);
}
