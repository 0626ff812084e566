#include "output/reports.h"

#include "output/messages.h"
#include "output/system_folders.h"

namespace {

const std::size_t ReportBlockSize = 1 << 16;

}  // namespace

void TellReportFailure(const std::string& fileName) { ShowMessage("Report failure", "Can't write " + fileName); }

bool CreateReportSilently(const std::string& fileName, ReportFile& report) {
    report = ReportFile();
    report.fileName = fileName;
    std::string folder = GetReportFolder();
    // Without a desktop the report goes to the current folder of the moment.
    if (!folder.empty() && !MakeFolderCurrent(folder)) return false;
    report.path = folder.empty() ? CurrentFolder() : folder;
    if (!report.path.empty() && report.path.back() != '\\') report.path += '\\';
    report.path += fileName;
    report.file = CreateForWriting(fileName);
    return report.file != 0;
}

bool CreateReport(const std::string& fileName, ReportFile& report) {
    if (CreateReportSilently(fileName, report)) return true;
    TellReportFailure(fileName);
    return false;
}

void WriteReportLine(ReportFile& report, std::string_view line) {
    if (report.file == 0) return;
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

void DiscardReport(ReportFile& report) {
    if (report.file == 0) return;
    CloseFile(report.file);
    report.file = 0;
    RemoveFile(report.path);
}

CommandResult WriteFindingsReport(const FindingsReport& shape, const std::vector<std::string>& findings) {
    FindingsWriter writer{shape};
    for (const std::string& finding : findings) AddFinding(writer, finding);
    return FinishFindings(writer, true);
}

void AddFinding(FindingsWriter& writer, std::string_view finding) {
    if (writer.findings++ == 0) {
        writer.notCreated = !CreateReportSilently(writer.shape.fileName, writer.report);
        WriteReportLine(writer.report, writer.shape.heading);
        WriteReportLine(writer.report, "");
    }
    WriteReportLine(writer.report, finding);
}

CommandResult FinishFindings(FindingsWriter& writer, bool readWhole) {
    if (!readWhole) {
        DiscardReport(writer.report);
        return CommandResult::Failed;
    }
    if (writer.findings == 0) {
        ShowMessage(writer.shape.noneTitle, writer.shape.noneText);
        return CommandResult::NothingFound;
    }
    if (writer.notCreated) {
        TellReportFailure(writer.shape.fileName);
        return CommandResult::Failed;
    }
    return FinishReport(writer.report) ? CommandResult::Findings : CommandResult::Failed;
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
