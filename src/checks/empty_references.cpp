#include "checks/empty_references.h"

#include "catalogue/catalogue_reader.h"
#include "output/app_state.h"
#include "output/messages.h"
#include "output/progress_list.h"
#include "output/reports.h"

// Whole-line equality: the key followed by anything but blanks names a mesh, or at least something.
std::vector<EmptyReference> FindEmptyReferenceLines(const std::string& catalogue) {
    std::vector<EmptyReference> found;
    EmptyReference reference;
    LineReader reader = LinesOf(catalogue);
    std::string_view line;
    while (NextCatalogueLine(reader, line)) {
        if (IsBuildingHeader(line)) {
            ++reference.objectNumber;
            reference.sectionName = SectionNameByEnds(line);
        } else if (line == "Mesh" || line == "MeshLive" || line == "MeshDead") {
            reference.key = line;
            found.push_back(reference);
        }
    }
    return found;
}

std::vector<std::string> EmptyReferenceLines(const EmptyReference& reference) {
    return {std::string(14, '*'), "Object " + std::to_string(reference.objectNumber),
            std::string(reference.sectionName), "Empty reference: " + std::string(reference.key)};
}

CommandResult FindEmptyReferencesInCatalogue(const std::string& catalogue, int& findings) {
    const std::string nothingFound = "No empty references found in your static.ini";
    findings = 0;
    if (ProgressListOn) {
        ClearProgressList();
        AddProgressLine("Empty references in your Static.ini");
        AddProgressLine(" ");
    }
    ReportFile report;
    if (!CreateReport("Empty_references.txt", report)) return CommandResult::Failed;
    WriteReportLine(report, "Empty references in your static.ini");
    WriteReportLine(report, "");

    std::vector<EmptyReference> found = FindEmptyReferenceLines(catalogue);
    findings = static_cast<int>(found.size());
    for (const EmptyReference& reference : found) {
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
    if (found.empty()) {
        if (ProgressListOn) AddProgressLine(nothingFound);
        WriteReportText(report, nothingFound);
    }
    if (!FinishReport(report)) return CommandResult::Failed;
    return found.empty() ? CommandResult::NothingFound : CommandResult::Findings;
}
