#include "checks/empty_references.h"

#include "checks/catalogue_opening.h"
#include "shell/app_state.h"
#include "shell/messages.h"
#include "shell/progress_list.h"
#include "shell/reports.h"

namespace {

const std::string NothingFoundLine = "No empty references found in your static.ini";

}  // namespace

// Whole-line equality: the key followed by anything but blanks names a mesh, or at least something.
std::string EmptyReferenceKey(const std::string& line) {
    if (line == "Mesh" || line == "MeshLive" || line == "MeshDead") return line;
    return "";
}

std::vector<std::string> EmptyReferenceLines(const EmptyReference& reference) {
    return {std::string(14, '*'), "Object " + std::to_string(reference.objectNumber), reference.sectionName,
            "Empty reference: " + reference.key};
}

CommandResult FindEmptyReferences(const std::string& catalogueFolder) {
    CatalogueReader reader;
    if (!OpenCatalogueForCheck(catalogueFolder, reader)) return CommandResult::Failed;
    if (ProgressListOn) {
        ClearProgressList();
        AddProgressLine("Empty references in your Static.ini");
        AddProgressLine(" ");
    }
    ReportFile report;
    if (!CreateReport("Empty_references.txt", report)) {
        CloseCatalogue(reader);
        return CommandResult::Failed;
    }
    WriteReportLine(report, "Empty references in your static.ini");
    WriteReportLine(report, "");

    EmptyReference reference;
    bool found = false;
    std::string line;
    while (NextCatalogueLine(reader, line)) {
        if (IsBuildingHeader(line)) {
            ++reference.objectNumber;
            reference.sectionName = SectionNameByEnds(line);
            continue;
        }
        reference.key = EmptyReferenceKey(line);
        if (reference.key.empty()) continue;
        found = true;
        std::vector<std::string> lines = EmptyReferenceLines(reference);
        if (ProgressListOn) {
            DrainPendingEvents();
            for (const std::string& progressLine : lines) AddProgressLine(progressLine);
        }
        // Only a "Mesh" finding opens with the ruler in the report; the other two run on from the
        // finding before them.
        for (std::size_t i = reference.key == "Mesh" ? 0 : 1; i < lines.size(); ++i)
            WriteReportLine(report, lines[i]);
    }
    if (!found) {
        if (ProgressListOn) AddProgressLine(NothingFoundLine);
        WriteReportText(report, NothingFoundLine);
    }
    CloseCatalogue(reader);
    if (!FinishReport(report)) return CommandResult::Failed;
    return found ? CommandResult::Findings : CommandResult::NothingFound;
}
