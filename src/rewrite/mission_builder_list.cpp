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

namespace {

const std::string HeadingRuler = "//" + std::string(41, '=');

// Writes an entry of the list per header, under a heading whenever the group title changes.
void WriteBuilderList(LineReader& catalogue, bool leaveOutPlates, ReportFile& list) {
    std::string_view line;
    std::string groupTitle;  // the untrimmed line after the latest "[***]"; "" before the first
    std::string lastTitle;   // the title of the latest heading written
    int counter = -1;
    while (NextCatalogueLine(catalogue, line)) {
        // Only a line with a "$" can hold "$kust" or "$suribachi", and only a header is tested for
        // "plate": the other lines, most of a big catalogue, need no lowered copy.
        bool dollar = line.find('$') != std::string_view::npos;
        std::string lower = dollar || IsBuildingHeader(line) ? LowerCopy(line) : std::string();
        if (dollar && (Contains(lower, "$kust") || Contains(lower, "$suribachi"))) continue;
        if (line == "[***]") {
            // The title line is taken whole and not judged, even when it is a header itself.
            groupTitle = NextPhysicalLine(catalogue, line) ? line : std::string_view();
            continue;
        }
        if (!IsBuildingHeader(line)) continue;
        int number = ++counter;
        // A plate header gives its number to the next header.
        if (leaveOutPlates && Contains(lower, "plate")) {
            --counter;
            continue;
        }
        if (groupTitle != lastTitle) {
            WriteReportLine(list, HeadingRuler);
            WriteReportLine(list, "[***]");
            WriteReportLine(list, groupTitle);
            WriteReportLine(list, HeadingRuler);
            lastTitle = groupTitle;
        }
        WriteReportLine(list, NumberInParentheses(number).append(" ").append(ObjectNameOf(line)));
    }
}

}  // namespace

CommandResult CreateMissionBuilderList(const std::string& catalogueFolder, BuilderList variant) {
    const bool plus = variant == BuilderList::FmbPlus;
    LineReader catalogue;
    if (!OpenCatalogue(catalogueFolder, catalogue, {"static.ini failure:", "Can't read the static,ini"}))
        return CommandResult::Failed;
    ReportFile list;
    if (!CreateReport(plus ? "Static_list_FMBplus.txt" : "Static_list_FMB.txt", list)) return CommandResult::Failed;
    WriteReportLine(list, plus ? "Object list for fmb+" : "Object list for fmb");
    WriteReportLine(list, "");
    WriteBuilderList(catalogue, !plus, list);
    if (!ReadToTheEnd(catalogue)) {
        DiscardReport(list);
        return CommandResult::Failed;
    }
    return FinishReport(list) ? CommandResult::Done : CommandResult::Failed;
}
