#include "commands/command_table.h"

#include "checks/doubled_objects.h"
#include "checks/empty_references.h"
#include "checks/irregular_entries.h"
#include "checks/mesh_references.h"
#include "commands/check_all.h"
#include "location/catalogue_folder.h"
#include "location/derived_paths.h"
#include "location/settings.h"
#include "maps/all_maps.h"
#include "maps/missing_map_objects.h"
#include "maps/missing_objects_window.h"
#include "output/app_state.h"
#include "output/reports.h"
#include "rewrite/mission_builder_list.h"
#include "rewrite/renumbering.h"

namespace {

// A catalogue check as a command, its count of findings left to check-all.
template <CommandResult (*check)(const std::string&, int&)>
CommandResult OnCatalogue(const CommandInput& input) {
    int findings = 0;
    return check(input.catalogueFolder, findings);
}

CommandResult CheckMissingObjects(const CommandInput& input) {
    if (!input.mapSelection.empty()) return FindMissingMapObjects(input.mapSelection, input.catalogueFolder);
    ShowMissingObjectsWindow(input.mapsPattern);
    return CommandResult::NothingFound;
}

CommandResult CheckMissingObjectsOfAllMaps(const CommandInput& input) {
    AllMapsCount count;
    CommandResult result = CheckAllMaps(input.catalogueFolder, input.mapsFolder, count);
    if (result != CommandResult::Failed && input.summary) input.summary(AllMapsSummary(count));
    return result;
}

const Command CommandRows[] = {
    {MenuDoubledObjects, "doubled-objects", "building headers whose section names occur more than once", true, false,
     OnCatalogue<FindDoubledObjects>},
    {MenuIrregularEntries, "irregular-entries", "lines that begin with none of the known prefixes", true, false,
     OnCatalogue<CheckIrregularEntries>},
    {MenuEmptyReferences, "empty-references", "Mesh, MeshLive and MeshDead lines without a value", true, false,
     OnCatalogue<FindEmptyReferences>},
    {MenuRenumber, "renumber", "rewrites static.ini with a number line above every building header", true, false,
     [](const CommandInput& in) { return RenumberCatalogue(in.catalogueFolder, Numbering::Renumber); }},
    {MenuDenumber, "denumber", "rewrites static.ini without its number lines", true, false,
     [](const CommandInput& in) { return RenumberCatalogue(in.catalogueFolder, Numbering::Denumber); }},
    {MenuListForFmb, "fmb-list", "object list for the mission builder, without plates (Static_list_FMB.txt)", true, false,
     [](const CommandInput& in) { return CreateMissionBuilderList(in.catalogueFolder, BuilderList::Fmb); }},
    {MenuListForFmbPlus, "fmb-plus-list", "object list for FMB+, with plates (Static_list_FMBplus.txt)", true, false,
     [](const CommandInput& in) { return CreateMissionBuilderList(in.catalogueFolder, BuilderList::FmbPlus); }},
    // The menu item opens the window in which maps are picked; verrant-cli names the map.
    {MenuMissingObjects, "missing-objects", "objects a map (--map FILE) places that the catalogue lacks", false, true,
     CheckMissingObjects},
    {0, "missing-objects", "every actors.static under mods\\mapmods\\maps\\ (Missing_objects_all_maps.txt)", true,
     false, CheckMissingObjectsOfAllMaps, "--all-maps", true},
    {MenuWrongSimReferences, "wrong-sim-references", "mesh files that no 3do folder of a mod holds", true, false,
     [](const CommandInput& in) {
         return CheckMeshReferences(in.catalogueFolder, in.modsRoot, MeshCheck::MissingMeshes);
     }},
    {MenuDoubledUsedSims, "doubled-used-sims", "objects whose MeshLive and MeshDead are the same file", true, false,
     [](const CommandInput& in) {
         return CheckMeshReferences(in.catalogueFolder, in.modsRoot, MeshCheck::SharedLiveDeadMeshes);
     }},
    {0, "check-all", "the five catalogue checks and every map, one line each; rewrites nothing", true, false,
     CheckAll, nullptr, true},
    {MenuSavePath, nullptr, "saves the catalogue folder in verrant.ini", true, false,
     [](const CommandInput& in) {
         return SavePath(in.catalogueFolder, in.startFolder) ? CommandResult::Done : CommandResult::Failed;
     }},
    {MenuClearPath, nullptr, "deletes verrant.ini", false, false,
     [](const CommandInput&) {
         ClearPath();
         return CommandResult::Done;
     }},
    {OpenCatalogueButtonId, nullptr, "opens static.ini in the text viewer", true, false,
     [](const CommandInput& in) {
         OpenCatalogueInViewer(in.catalogueFolder);
         return CommandResult::Done;
     }},
};
}  // namespace

const std::span<const Command> Commands = CommandRows;

const Command* CommandWithId(int id) {
    if (id == 0) return nullptr;
    for (const Command& command : Commands)
        if (command.id == id) return &command;
    return nullptr;
}

const Command* CommandNamed(std::string_view cliName, std::string_view cliOption) {
    for (const Command& command : Commands)
        if (command.cliName && cliName == command.cliName && cliOption == (command.cliOption ? command.cliOption : ""))
            return &command;
    return nullptr;
}

CommandResult RunCommand(const Command& command, const std::string& mapSelection,
                         const std::function<void(const std::string&)>& summary) {
    if (command.needsCatalogueFolder && !EnsureCatalogueFolder()) return CommandResult::NoFolder;
    CommandInput input;
    input.catalogueFolder = CatalogueFolder;
    input.modsRoot = DeriveModsRoot(CatalogueFolder);
    input.mapsPattern = MapsPattern;
    input.mapsFolder = MapsPattern.substr(0, MapsPattern.rfind('\\') + 1);
    input.mapSelection = mapSelection;
    input.startFolder = StartFolder;
    input.summary = summary;
    return command.run(input);
}
