#include "maps/missing_map_objects.h"

#include "catalogue/catalogue_reader.h"
#include "catalogue/name_table.h"
#include "output/catalogue_loading.h"
#include "maps/map_file.h"
#include "output/app_state.h"
#include "output/messages.h"
#include "output/progress_list.h"
#include "output/reports.h"


// The map's names in one table, each with the first ordinal met in a walk over the headers.
std::vector<int> FirstSectionOrdinals(const std::vector<std::string>& mapNames, LineReader& catalogue) {
    std::vector<std::string_view> names(mapNames.begin(), mapNames.end());
    std::vector<int> firstOrdinal(names.size(), NotInCatalogue);
    NameTable place = FirstPlaces(names);
    int ordinal = 0;
    ForEachBuildingSectionName(catalogue, [&](std::string_view name) {
        int slot = NameSlot(place, names, name);
        if (slot >= 0 && firstOrdinal[slot] == NotInCatalogue) firstOrdinal[slot] = ordinal;
        ++ordinal;
    });
    std::vector<int> ordinals;
    ordinals.reserve(names.size());
    for (std::string_view name : names) ordinals.push_back(firstOrdinal[NameSlot(place, names, name)]);
    return ordinals;
}

CommandResult FindMissingMapObjects(const std::string& selection, const std::string& catalogueFolder) {
    std::string folder, fileName;
    SplitMapFileSelection(selection, folder, fileName);
    std::vector<std::string> mapNames = ExtractMapObjectNames(ReadMapFileText(folder, fileName));
    DrainPendingEvents();

    LineReader catalogue;
    if (!OpenCatalogue(catalogueFolder, catalogue, {})) return CommandResult::Failed;
    std::vector<int> ordinals = FirstSectionOrdinals(mapNames, catalogue);
    if (!ReadToTheEnd(catalogue)) return CommandResult::Failed;
    DrainPendingEvents();
    if (ProgressListOn) ClearProgressList();

    std::vector<std::string> missing;
    for (std::size_t i = 0; i < mapNames.size(); ++i) {
        if (ordinals[i] != NotInCatalogue && ProgressListOn) {
            DrainPendingEvents();
            AddProgressLine("Found object (" + std::to_string(ordinals[i]) + "): " + mapNames[i]);
        }
        DrainPendingEvents();
        if (ordinals[i] == NotInCatalogue) {
            missing.push_back(mapNames[i]);
            if (ProgressListOn) AddProgressLine("Missing: " + mapNames[i]);
        }
    }
    if (ProgressListOn) {
        AddProgressLine("");
        AddProgressLine("Total number of objects: " + std::to_string(mapNames.size()));
    }

    return WriteFindingsReport({"Missing_objects.txt", "Missing objects in your static.ini:", "No missing objects found",
                                "All maps objects found in your static.ini"},
                               missing);
}
