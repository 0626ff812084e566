// Report files on the desktop and the text viewer that opens them.
#pragma once

#include "platform/platform.h"
#include "output/command_result.h"

#include <string>
#include <string_view>
#include <vector>

struct ReportFile {
    Handle file = 0;
    std::string fileName;
    std::string path;     // where it was created, so a report cut off can be removed from anywhere
    std::string pending;  // written out in large blocks
    bool failed = false;
};

// Creates the report in the report folder, replacing an older one. When it cannot be created the
// user is told ("Report failure") and false comes back.
bool CreateReport(const std::string& fileName, ReportFile& report);
// The same without a word when it cannot be created.
bool CreateReportSilently(const std::string& fileName, ReportFile& report);
void TellReportFailure(const std::string& fileName);
void WriteReportLine(ReportFile& report, std::string_view line);  // followed by CR LF
void WriteReportText(ReportFile& report, std::string_view text);  // no line end
// Hands the buffered text to the file; false when any of the report's text failed to reach it.
bool WritePendingText(ReportFile& report);
// Closes the report and opens it in the viewer; when its text did not all reach the disk the report
// is removed, the user is told instead and false comes back.
bool FinishReport(ReportFile& report);
// Closes and removes a report that will not be finished, as after a catalogue that could not be read
// to its end; the user is not told.
void DiscardReport(ReportFile& report);

// The usual report of a check: with no findings the message box says so and nothing is written;
// otherwise the heading, an empty line and the findings, then the viewer.
struct FindingsReport {
    std::string fileName, heading;
    std::string noneTitle, noneText;
};
CommandResult WriteFindingsReport(const FindingsReport& report, const std::vector<std::string>& findings);

// The same report written while the check finds: it is created at the first finding and the
// findings are never held. A report that cannot be created is told of at the end, after the
// check's progress lines, as when the findings were written after the check.
struct FindingsWriter {
    explicit FindingsWriter(FindingsReport reportShape) : shape(std::move(reportShape)) {}
    FindingsReport shape;
    ReportFile report;
    int findings = 0;
    bool notCreated = false;
};
void AddFinding(FindingsWriter& writer, std::string_view finding);
// With readWhole false the report is removed and nothing more is said: the reader told the user.
CommandResult FinishFindings(FindingsWriter& writer, bool readWhole);

void OpenReportInViewer(const std::string& fileName);
bool StartTextViewer(const std::string& fileName, const std::string& workingFolder);
void OpenCatalogueInViewer(const std::string& catalogueFolder);
