// The list reads, for "fmb":
//
//   Object list for fmb
//
//   //=========================================
//   [***]
//   Title House
//   //=========================================
//   (0) Kiosk
#include "rewrite/mission_builder_list.h"

#include "catalogue/catalogue_reader.h"
#include "catalogue/text.h"
#include "output/catalogue_loading.h"
#include "output/reports.h"

#include <vector>

namespace {

struct BuilderListEntry {
    std::string_view groupTitle;  // the untrimmed line after the latest "[***]"; "" before the first
    int number = 0;
    bool isPlate = false;  // the list without plates only
    std::string_view objectName;
};

const std::string HeadingRuler = "//" + std::string(41, '=');

std::vector<BuilderListEntry> ReadBuilderEntries(const std::string& catalogue, bool leaveOutPlates) {
    std::vector<BuilderListEntry> entries;
    std::string_view groupTitle, line;
    int counter = -1;
    LineReader reader = LinesOf(catalogue);
    while (NextCatalogueLine(reader, line)) {
        // Only a line with a "$" can hold "$kust" or "$suribachi", and only a header is tested for
        // "plate": the other lines, most of a big catalogue, need no lowered copy.
        bool dollar = line.find('$') != std::string_view::npos;
        std::string lower = dollar || IsBuildingHeader(line) ? LowerCopy(line) : std::string();
        if (dollar && (Contains(lower, "$kust") || Contains(lower, "$suribachi"))) continue;
        if (line == "[***]") {
            // The title line is taken whole and not judged, even when it is a header itself.
            if (!NextPhysicalLine(reader, groupTitle)) groupTitle = {};
        } else if (IsBuildingHeader(line)) {
            BuilderListEntry entry;
            entry.groupTitle = groupTitle;
            entry.number = ++counter;
            entry.objectName = ObjectNameOf(line);
            // A plate header gives its number to the next header.
            if (leaveOutPlates && Contains(lower, "plate")) {
                entry.isPlate = true;
                --counter;
            }
            entries.push_back(entry);
        }
    }
    return entries;
}

void WriteBuilderList(ReportFile& list, const std::string& firstLine,
                      const std::vector<BuilderListEntry>& entries) {
    WriteReportLine(list, firstLine);
    WriteReportLine(list, "");
    std::string_view lastTitle;
    for (const BuilderListEntry& entry : entries) {
        if (entry.isPlate) continue;
        if (entry.groupTitle != lastTitle) {
            WriteReportLine(list, HeadingRuler);
            WriteReportLine(list, "[***]");
            WriteReportLine(list, entry.groupTitle);
            WriteReportLine(list, HeadingRuler);
            lastTitle = entry.groupTitle;
        }
        WriteReportLine(list, NumberInParentheses(entry.number).append(" ").append(entry.objectName));
    }
}

}  // namespace

CommandResult CreateMissionBuilderList(const std::string& catalogueFolder, BuilderList variant) {
    const bool plus = variant == BuilderList::FmbPlus;
    std::string catalogue;
    if (!LoadCatalogue(catalogueFolder, catalogue, {"static.ini failure:", "Can't read the static,ini"}))
        return CommandResult::Failed;
    std::vector<BuilderListEntry> entries = ReadBuilderEntries(catalogue, !plus);
    ReportFile list;
    if (!CreateReport(plus ? "Static_list_FMBplus.txt" : "Static_list_FMB.txt", list))
        return CommandResult::Failed;
    WriteBuilderList(list, plus ? "Object list for fmb+" : "Object list for fmb", entries);
    return FinishReport(list) ? CommandResult::Done : CommandResult::Failed;
}
