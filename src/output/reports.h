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
void WriteReportLine(ReportFile& report, std::string_view line);  // followed by CR LF
void WriteReportText(ReportFile& report, std::string_view text);  // no line end
// Hands the buffered text to the file; false when any of the report's text failed to reach it.
bool WritePendingText(ReportFile& report);
// Closes the report and opens it in the viewer; when its text did not all reach the disk the report
// is removed, the user is told instead and false comes back.
bool FinishReport(ReportFile& report);

// The usual report of a check: with no findings the message box says so and nothing is written;
// otherwise the heading, an empty line and the findings, then the viewer.
struct FindingsReport {
    std::string fileName, heading;
    std::string noneTitle, noneText;
};
CommandResult WriteFindingsReport(const FindingsReport& report, const std::vector<std::string>& findings);

void OpenReportInViewer(const std::string& fileName);
bool StartTextViewer(const std::string& fileName, const std::string& workingFolder);
void OpenCatalogueInViewer(const std::string& catalogueFolder);
