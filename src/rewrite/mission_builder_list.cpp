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
#include "shell/messages.h"
#include "shell/reports.h"

#include <vector>

namespace {

struct BuilderListEntry {
    std::string groupTitle;  // the untrimmed line after the latest "[***]"; "" before the first
    int number = 0;
    bool isPlate = false;  // mode "fmb" only
    std::string objectName;
};

const std::string HeadingRuler = "//" + std::string(41, '=');

std::vector<BuilderListEntry> ReadBuilderEntries(CatalogueReader& catalogue, bool leaveOutPlates) {
    std::vector<BuilderListEntry> entries;
    std::string groupTitle;
    int counter = -1;
    std::string line;
    while (NextCatalogueLine(catalogue, line)) {
        std::string lower = LowerCopy(line);
        if (Contains(lower, "$kust") || Contains(lower, "$suribachi")) continue;
        if (line == "[***]") {
            // The title line is taken whole and not judged, even when it is a header itself.
            NextPhysicalLine(catalogue, groupTitle);
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
    std::string lastTitle;
    for (const BuilderListEntry& entry : entries) {
        if (entry.isPlate) continue;
        if (entry.groupTitle != lastTitle) {
            WriteReportLine(list, HeadingRuler);
            WriteReportLine(list, "[***]");
            WriteReportLine(list, entry.groupTitle);
            WriteReportLine(list, HeadingRuler);
            lastTitle = entry.groupTitle;
        }
        WriteReportLine(list, NumberInParentheses(entry.number) + " " + entry.objectName);
    }
}

}  // namespace

CommandResult CreateMissionBuilderList(const std::string& catalogueFolder, const std::string& mode) {
    bool plus = mode == "fmb+";
    CatalogueReader catalogue;
    if (!OpenCatalogue(catalogueFolder, catalogue, "Static.ini")) {
        ShowMessage("static.ini failure:", "Can't read the static,ini");
        return CommandResult::Failed;
    }
    std::vector<BuilderListEntry> entries = ReadBuilderEntries(catalogue, !plus);
    CloseCatalogue(catalogue);

    ReportFile list;
    if (!CreateReport(plus ? "Static_list_FMBplus.txt" : "Static_list_FMB.txt", list))
        return CommandResult::Failed;
    WriteBuilderList(list, plus ? "Object list for fmb+" : "Object list for fmb", entries);
    return FinishReport(list) ? CommandResult::Done : CommandResult::Failed;
}
