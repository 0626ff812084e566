#include "output/reports.h"

#include "output/messages.h"
#include "output/system_folders.h"

namespace {

const std::size_t ReportBlockSize = 1 << 16;

void TellReportFailure(const std::string& fileName) { ShowMessage("Report failure", "Can't write " + fileName); }

}  // namespace

bool CreateReport(const std::string& fileName, ReportFile& report) {
    report = ReportFile();
    report.fileName = fileName;
    std::string folder = GetReportFolder();
    // Without a desktop the report goes to the current folder of the moment.
    if (!folder.empty() && !MakeFolderCurrent(folder)) {
        TellReportFailure(fileName);
        return false;
    }
    report.path = folder.empty() ? CurrentFolder() : folder;
    if (!report.path.empty() && report.path.back() != '\\') report.path += '\\';
    report.path += fileName;
    report.file = CreateForWriting(fileName);
    if (report.file == 0) {
        TellReportFailure(fileName);
        return false;
    }
    return true;
}

void WriteReportLine(ReportFile& report, std::string_view line) {
    WriteReportText(report, line);
    report.pending += "\r\n";
}

void WriteReportText(ReportFile& report, std::string_view text) {
    if (report.file == 0) return;
    report.pending += text;
    if (report.pending.size() >= ReportBlockSize) WritePendingText(report);
}

bool WritePendingText(ReportFile& report) {
    if (!report.pending.empty() && !WriteBytes(report.file, report.pending.data(), report.pending.size()))
        report.failed = true;
    report.pending.clear();
    return !report.failed;
}

bool FinishReport(ReportFile& report) {
    if (report.file == 0) return false;
    WritePendingText(report);
    if (!CloseFile(report.file)) report.failed = true;
    report.file = 0;
    if (report.failed) {
        RemoveFile(report.path);
        TellReportFailure(report.fileName);
        return false;
    }
    OpenReportInViewer(report.fileName);
    return true;
}

CommandResult WriteFindingsReport(const FindingsReport& shape, const std::vector<std::string>& findings) {
    if (findings.empty()) {
        ShowMessage(shape.noneTitle, shape.noneText);
        return CommandResult::NothingFound;
    }
    ReportFile report;
    if (!CreateReport(shape.fileName, report)) return CommandResult::Failed;
    WriteReportLine(report, shape.heading);
    WriteReportLine(report, "");
    for (const std::string& finding : findings) WriteReportLine(report, finding);
    return FinishReport(report) ? CommandResult::Findings : CommandResult::Failed;
}

void OpenReportInViewer(const std::string& fileName) { StartTextViewer(fileName, GetReportFolder()); }

bool StartTextViewer(const std::string& fileName, const std::string& workingFolder) {
    std::string viewer = WindowsFolder() + "\\notepad.exe";
    if (StartProcess("\"" + viewer + "\" " + fileName, workingFolder)) return true;
    std::string shellFolder = workingFolder;
    if (shellFolder.empty()) shellFolder = viewer.substr(0, viewer.rfind('\\') + 1);
    return ShellExecuteOpen(viewer, fileName, shellFolder);
}

void OpenCatalogueInViewer(const std::string& catalogueFolder) {
    if (!StartTextViewer("static.ini", catalogueFolder)) ShowMessage("static.ini failure", "Can't open static.ini");
}
