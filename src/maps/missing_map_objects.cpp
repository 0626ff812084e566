#include "maps/missing_map_objects.h"

#include "catalogue/catalogue_reader.h"
#include "catalogue/name_table.h"
#include "output/catalogue_loading.h"
#include "maps/map_file.h"
#include "output/app_state.h"
#include "output/messages.h"
#include "output/progress_list.h"
#include "output/reports.h"


// One index of first ordinals gives the numbers of a walk from the first header, without
// walking the headers once per name.
std::vector<int> FirstSectionOrdinals(const std::vector<std::string>& mapNames,
                                      const std::vector<std::string_view>& sectionNames) {
    NameTable firstOrdinal = NameTableFor(sectionNames.size());
    for (std::size_t i = 0; i < sectionNames.size(); ++i) {
        int& slot = NameSlot(firstOrdinal, sectionNames, sectionNames[i]);
        if (slot < 0) slot = static_cast<int>(i);
    }
    std::vector<int> ordinals;
    ordinals.reserve(mapNames.size());
    for (const std::string& name : mapNames) {
        int slot = NameSlot(firstOrdinal, sectionNames, name);
        ordinals.push_back(slot < 0 ? NotInCatalogue : slot);
    }
    return ordinals;
}

CommandResult FindMissingMapObjects(const std::string& selection, const std::string& catalogueFolder) {
    std::string folder, fileName;
    SplitMapFileSelection(selection, folder, fileName);
    std::vector<std::string> mapNames = ExtractMapObjectNames(ReadMapFileText(folder, fileName));
    DrainPendingEvents();

    std::string catalogue;
    if (!LoadCatalogue(catalogueFolder, catalogue, {})) return CommandResult::Failed;
    std::vector<std::string_view> sectionNames = BuildingSectionNames(catalogue);
    DrainPendingEvents();
    if (ProgressListOn) ClearProgressList();

    std::vector<int> ordinals = FirstSectionOrdinals(mapNames, sectionNames);
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
