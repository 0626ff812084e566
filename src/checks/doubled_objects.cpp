#include "checks/doubled_objects.h"

#include "checks/catalogue_opening.h"
#include "location/catalogue_folder.h"
#include "shell/app_state.h"
#include "shell/messages.h"
#include "shell/progress_list.h"
#include "shell/reports.h"

#include <string_view>
#include <unordered_map>

namespace {

const std::string Ruler67(67, '*');

}  // namespace

// One pass from the end finds each name's next occurrence, so the pairs come out in the order of
// the pairwise walk without its square cost.
std::vector<DoubledObject> PairDoubledNames(const std::vector<std::string>& names) {
    std::vector<int> next(names.size(), -1);
    std::unordered_map<std::string_view, int> laterOccurrence;
    laterOccurrence.reserve(names.size());
    for (int i = static_cast<int>(names.size()) - 1; i >= 0; --i) {
        auto [it, inserted] = laterOccurrence.try_emplace(names[i], i);
        if (!inserted) {
            next[i] = it->second;
            it->second = i;
        }
    }
    std::vector<DoubledObject> doubles;
    for (int i = 0; i < static_cast<int>(names.size()); ++i)
        if (next[i] >= 0) doubles.push_back({i, next[i], names[i]});
    return doubles;
}

std::string DoubledObjectLine(const DoubledObject& doubled) {
    return "Double object (" + std::to_string(doubled.firstIndex) + ") => (" + std::to_string(doubled.secondIndex) +
           "): " + doubled.sectionName;
}

CommandResult FindDoubledObjects() {
    EnsureCatalogueFolder();
    if (CatalogueFolder.empty()) return CommandResult::NoFolder;
    CatalogueReader reader;
    if (!OpenCatalogueForCheck(CatalogueFolder, reader)) return CommandResult::Failed;
    if (ProgressListOn) ClearProgressList();

    std::vector<std::string> names;
    std::string line;
    while (NextCatalogueLine(reader, line))
        if (IsBuildingHeader(line)) names.push_back(SectionNameByBracket(line));
    CloseCatalogue(reader);
    DrainPendingEvents();

    std::vector<DoubledObject> doubles = PairDoubledNames(names);
    std::size_t nextDouble = 0;
    for (int i = 0; i < static_cast<int>(names.size()); ++i) {
        if (!ProgressListOn) break;
        DrainPendingEvents();
        AddProgressLine("Build (" + std::to_string(i) + ") " + names[i]);
        if (nextDouble < doubles.size() && doubles[nextDouble].firstIndex == i) {
            DrainPendingEvents();
            AddProgressLine(Ruler67);
            AddProgressLine(DoubledObjectLine(doubles[nextDouble++]));
            AddProgressLine(Ruler67);
        }
    }
    if (ProgressListOn) {
        AddProgressLine("");
        AddProgressLine("Total number of objects: " + std::to_string(names.size()));
    }

    if (doubles.empty()) {
        ShowMessage("No doubled objects", "No doubled objects found in your static.ini");
        return CommandResult::NothingFound;
    }
    std::vector<std::string> findings;
    for (const DoubledObject& doubled : doubles) findings.push_back(DoubledObjectLine(doubled));
    return WriteFindingsReport("Doubled_objects.txt", "Doubled objects in your static.ini:", findings);
}
