#include "checks/empty_references.h"

#include "catalogue/catalogue_reader.h"
#include "output/app_state.h"
#include "output/catalogue_loading.h"
#include "output/messages.h"
#include "output/progress_list.h"
#include "output/reports.h"

// Whole-line equality: the key followed by anything but blanks names a mesh, or at least something.
void FindEmptyReferenceLines(LineReader& catalogue, const std::function<void(const EmptyReference&)>& sink) {
    EmptyReference reference;
    std::string sectionName;  // the line it was cut from is gone by the time a key follows
    std::string_view line;
    while (NextCatalogueLine(catalogue, line)) {
        if (IsBuildingHeader(line)) {
            ++reference.objectNumber;
            sectionName = SectionNameByEnds(line);
        } else if (line == "Mesh" || line == "MeshLive" || line == "MeshDead") {
            reference.sectionName = sectionName;
            reference.key = line;
            sink(reference);
        }
    }
}

std::vector<std::string> EmptyReferenceLines(const EmptyReference& reference) {
    return {std::string(14, '*'), "Object " + std::to_string(reference.objectNumber),
            std::string(reference.sectionName), "Empty reference: " + std::string(reference.key)};
}

CommandResult FindEmptyReferences(const std::string& catalogueFolder, int& findings) {
    const std::string nothingFound = "No empty references found in your static.ini";
    findings = 0;
    LineReader catalogue;
    if (!OpenCatalogue(catalogueFolder, catalogue, CantOpenCatalogue)) return CommandResult::Failed;
    if (ProgressListOn) {
        ClearProgressList();
        AddProgressLine("Empty references in your Static.ini");
        AddProgressLine(" ");
    }
    ReportFile report;
    if (!CreateReport("Empty_references.txt", report)) return CommandResult::Failed;
    WriteReportLine(report, "Empty references in your static.ini");
    WriteReportLine(report, "");

    FindEmptyReferenceLines(catalogue, [&](const EmptyReference& reference) {
        ++findings;
        std::vector<std::string> lines = EmptyReferenceLines(reference);
        if (ProgressListOn) {
            DrainPendingEvents();
            for (const std::string& progressLine : lines) AddProgressLine(progressLine);
        }
        // Only a "Mesh" finding opens with the ruler in the report; the other two run on from the
        // finding before them.
        for (std::size_t i = reference.key == "Mesh" ? 0 : 1; i < lines.size(); ++i)
            WriteReportLine(report, lines[i]);
    });
    if (!ReadToTheEnd(catalogue)) {
        DiscardReport(report);
        return CommandResult::Failed;
    }
    if (findings == 0) {
        if (ProgressListOn) AddProgressLine(nothingFound);
        WriteReportText(report, nothingFound);
    }
    if (!FinishReport(report)) return CommandResult::Failed;
    return findings == 0 ? CommandResult::NothingFound : CommandResult::Findings;
}
