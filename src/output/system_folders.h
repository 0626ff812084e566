// The folders and values the system names: the desktop, the Windows folder, the environment.
#pragma once

#include <string>

// A shell special folder's path ending in "\", "" when unknown; the program asks for id 0 only.
std::string GetSpecialFolderPath(int folderId);
// The variable's value, "" when it is not set.
std::string GetEnvironmentValue(const std::string& name);
// "WINDIR", or the Windows folder the system reports when it is not set.
std::string WindowsFolder();
// Where reports go: the desktop.
std::string GetReportFolder();
