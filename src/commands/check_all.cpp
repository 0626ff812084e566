#include "commands/check_all.h"

#include "checks/doubled_objects.h"
#include "checks/empty_references.h"
#include "checks/irregular_entries.h"
#include "checks/mesh_references.h"
#include "maps/all_maps.h"
#include "output/catalogue_loading.h"

#include <cstdio>

namespace {

struct CheckStep {
    const char* name;    // as verrant-cli names the single command
    const char* report;  // the report the single command writes
    CommandResult (*run)(const CommandInput& input, SharedMeshIndex& meshIndex, int& findings);
};

// The order a builder reads them in: the catalogue's own faults first, then its meshes, then maps.
const CheckStep Steps[] = {
    {"doubled-objects", "Doubled_objects.txt",
     [](const CommandInput& input, SharedMeshIndex&, int& findings) {
         return FindDoubledObjects(input.catalogueFolder, findings);
     }},
    {"irregular-entries", "Irregular_entrys.txt",
     [](const CommandInput& input, SharedMeshIndex&, int& findings) {
         return CheckIrregularEntries(input.catalogueFolder, findings);
     }},
    {"empty-references", "Empty_references.txt",
     [](const CommandInput& input, SharedMeshIndex&, int& findings) {
         return FindEmptyReferences(input.catalogueFolder, findings);
     }},
    {"wrong-sim-references", "Missing_3do.txt",
     [](const CommandInput& input, SharedMeshIndex& meshIndex, int& findings) {
         return CheckMeshReferencesSharing(input.catalogueFolder, input.modsRoot, MeshCheck::MissingMeshes,
                                           meshIndex, findings);
     }},
    {"doubled-used-sims", "Doubled_sims_or_meshes.txt",
     [](const CommandInput& input, SharedMeshIndex& meshIndex, int& findings) {
         return CheckMeshReferencesSharing(input.catalogueFolder, input.modsRoot, MeshCheck::SharedLiveDeadMeshes,
                                           meshIndex, findings);
     }},
    {"missing-objects --all-maps", "Missing_objects_all_maps.txt",
     [](const CommandInput& input, SharedMeshIndex& meshIndex, int& findings) {
         meshIndex = SharedMeshIndex();  // the mesh checks are done: their index goes before the names come
         AllMapsCount count;
         CommandResult result = CheckAllMaps(input.catalogueFolder, input.mapsFolder, count);
         findings = count.namesMissing + count.notMaps;
         return result;
     }},
};

std::string SummaryLine(const std::string& name, const std::string& count, const std::string& outcome) {
    char line[160];
    std::snprintf(line, sizeof line, "%-28s%6s  %s", name.c_str(), count.c_str(), outcome.c_str());
    std::string text = line;
    return text.substr(0, text.find_last_not_of(' ') + 1);
}

}  // namespace

CommandResult CheckAll(const CommandInput& input) {
    // Each check reads the catalogue on its own, a block at a time; one that does not read whole is
    // told of once, here, rather than by every check.
    SharedMeshIndex meshIndex;
    meshIndex.forASecondCheck = true;
    bool read = CatalogueReadsWhole(input.catalogueFolder, CantOpenCatalogue);
    bool failed = !read, found = false;
    int total = 0;
    std::vector<std::string> lines;
    for (const CheckStep& step : Steps) {
        int findings = 0;
        CommandResult result = read ? step.run(input, meshIndex, findings) : CommandResult::Failed;
        if (result == CommandResult::Failed) {
            failed = true;
            lines.push_back(SummaryLine(step.name, "-", "could not run"));
            continue;
        }
        found = found || result == CommandResult::Findings;
        total += findings;
        lines.push_back(SummaryLine(step.name, std::to_string(findings),
                                    result == CommandResult::Findings ? step.report : "clean"));
    }
    lines.push_back(SummaryLine("total", std::to_string(total), failed ? "not every check could run" : ""));
    // After every check, so that the progress lines of all of them come first.
    if (input.summary)
        for (const std::string& line : lines) input.summary(line);
    return failed ? CommandResult::Failed : found ? CommandResult::Findings : CommandResult::NothingFound;
}
