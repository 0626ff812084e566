#include "checks/doubled_objects.h"

#include "catalogue/catalogue_reader.h"
#include "catalogue/name_table.h"
#include "output/app_state.h"
#include "output/messages.h"
#include "output/progress_list.h"
#include "output/reports.h"


// One pass from the end finds each name's next occurrence, so the pairs come out in the order of
// the pairwise walk without its square cost.
std::vector<DoubledObject> PairDoubledNames(const std::vector<std::string_view>& names) {
    std::vector<int> next(names.size(), -1);
    NameTable laterOccurrence = NameTableFor(names.size());
    for (int i = static_cast<int>(names.size()) - 1; i >= 0; --i) {
        int& slot = NameSlot(laterOccurrence, names, names[i]);
        next[i] = slot;
        slot = i;
    }
    std::vector<DoubledObject> doubles;
    for (int i = 0; i < static_cast<int>(names.size()); ++i)
        if (next[i] >= 0) doubles.push_back({i, next[i], names[i]});
    return doubles;
}

std::string DoubledObjectLine(const DoubledObject& doubled) {
    std::string line = "Double object (" + std::to_string(doubled.firstIndex) + ") => (" +
                       std::to_string(doubled.secondIndex) + "): ";
    return line.append(doubled.sectionName);
}

namespace {

void ListObjectsAndDoubles(const std::vector<std::string_view>& names, const std::vector<DoubledObject>& doubles) {
    const std::string ruler(67, '*');
    std::size_t nextDouble = 0;
    for (int i = 0; i < static_cast<int>(names.size()); ++i) {
        DrainPendingEvents();
        AddProgressLine("Build (" + std::to_string(i) + ") " + std::string(names[i]));
        if (nextDouble < doubles.size() && doubles[nextDouble].firstIndex == i) {
            DrainPendingEvents();
            AddProgressLine(ruler);
            AddProgressLine(DoubledObjectLine(doubles[nextDouble++]));
            AddProgressLine(ruler);
        }
    }
    AddProgressLine("");
    AddProgressLine("Total number of objects: " + std::to_string(names.size()));
}

}  // namespace

CommandResult FindDoubledObjectsInCatalogue(const std::string& catalogue, int& findings) {
    if (ProgressListOn) ClearProgressList();
    std::vector<std::string_view> names = BuildingSectionNames(catalogue);
    DrainPendingEvents();
    std::vector<DoubledObject> doubles = PairDoubledNames(names);
    if (ProgressListOn) ListObjectsAndDoubles(names, doubles);

    std::vector<std::string> lines;
    for (const DoubledObject& doubled : doubles) lines.push_back(DoubledObjectLine(doubled));
    findings = static_cast<int>(lines.size());
    return WriteFindingsReport({"Doubled_objects.txt", "Doubled objects in your static.ini:", "No doubled objects",
                                "No doubled objects found in your static.ini"},
                               lines);
}
