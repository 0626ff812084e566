// Report files on the desktop and the text viewer that opens them.
#pragma once

#include "platform/platform.h"
#include "shell/command_result.h"

#include <string>
#include <vector>

struct ReportFile {
    Handle file = 0;
    std::string fileName;
    std::string pending;  // written out in large blocks
    bool failed = false;
};

// A shell special folder's path ending in "\", "" when unknown; the program asks for id 0 only.
std::string GetSpecialFolderPath(int folderId);
// The variable's value, "" when it is not set.
std::string GetEnvironmentValue(const std::string& name);
// "WINDIR", or the Windows folder the system reports when it is not set.
std::string WindowsFolder();
std::string GetReportFolder();

// Creates the report in the report folder, replacing an older one. When it cannot be created the
// user is told ("Report failure") and false comes back.
bool CreateReport(const std::string& fileName, ReportFile& report);
void WriteReportLine(ReportFile& report, const std::string& line);  // followed by CR LF
void WriteReportText(ReportFile& report, const std::string& text);  // no line end
// Hands the buffered text to the file; false when any of the report's text failed to reach it.
bool WritePendingText(ReportFile& report);
// Closes the report and opens it in the viewer; when its text did not all reach the disk the user
// is told instead and false comes back.
bool FinishReport(ReportFile& report);

// The usual report: the heading, an empty line and the findings, then the viewer. Findings when
// it all reached the disk; Failed, with the user told, when not.
CommandResult WriteFindingsReport(const std::string& fileName, const std::string& heading,
                                  const std::vector<std::string>& findings);

void OpenReportInViewer(const std::string& fileName);
bool StartTextViewer(const std::string& fileName, const std::string& workingFolder);
void OpenCatalogueInViewer(const std::string& catalogueFolder);
