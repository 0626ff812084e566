#include "commands/check_all.h"

#include "checks/doubled_objects.h"
#include "checks/empty_references.h"
#include "checks/irregular_entries.h"
#include "checks/mesh_references.h"
#include "maps/all_maps.h"
#include "output/catalogue_loading.h"

#include <cstdio>

namespace {

// What the steps of one run share: the catalogue's bytes and the mesh index.
struct SharedRead {
    std::string catalogue;
    SharedMeshIndex meshIndex;
};

struct CheckStep {
    const char* name;    // as verrant-cli names the single command
    const char* report;  // the report the single command writes
    CommandResult (*run)(SharedRead& read, const CommandInput& input, int& findings);
};

// The order a builder reads them in: the catalogue's own faults first, then its meshes, then maps.
const CheckStep Steps[] = {
    {"doubled-objects", "Doubled_objects.txt",
     [](SharedRead& read, const CommandInput&, int& findings) {
         return FindDoubledObjectsInCatalogue(read.catalogue, findings);
     }},
    {"irregular-entries", "Irregular_entrys.txt",
     [](SharedRead& read, const CommandInput&, int& findings) {
         return CheckIrregularEntriesInCatalogue(read.catalogue, findings);
     }},
    {"empty-references", "Empty_references.txt",
     [](SharedRead& read, const CommandInput&, int& findings) {
         return FindEmptyReferencesInCatalogue(read.catalogue, findings);
     }},
    {"wrong-sim-references", "Missing_3do.txt",
     [](SharedRead& read, const CommandInput& input, int& findings) {
         return CheckMeshReferencesInCatalogue(read.catalogue, input.modsRoot, MeshCheck::MissingMeshes,
                                               read.meshIndex, findings);
     }},
    {"doubled-used-sims", "Doubled_sims_or_meshes.txt",
     [](SharedRead& read, const CommandInput& input, int& findings) {
         return CheckMeshReferencesInCatalogue(read.catalogue, input.modsRoot,
                                               MeshCheck::SharedLiveDeadMeshes, read.meshIndex, findings);
     }},
    {"missing-objects --all-maps", "Missing_objects_all_maps.txt",
     [](SharedRead& read, const CommandInput& input, int& findings) {
         AllMapsCount count;
         CommandResult result = FindMissingObjectsOfAllMaps(read.catalogue, input.mapsFolder, count);
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
    SharedRead shared;
    bool read = LoadCatalogue(input.catalogueFolder, shared.catalogue, CantOpenCatalogue);
    bool failed = !read, found = false;
    int total = 0;
    std::vector<std::string> lines;
    for (const CheckStep& step : Steps) {
        int findings = 0;
        CommandResult result = read ? step.run(shared, input, findings) : CommandResult::Failed;
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
