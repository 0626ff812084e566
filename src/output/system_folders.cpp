#include "output/system_folders.h"

#include "platform/platform.h"

std::string GetSpecialFolderPath(int folderId) {
    if (folderId != 0) return "";
    std::string path = DesktopFolderPath();
    if (!path.empty() && path.back() != '\\') path += '\\';
    return path;
}

std::string GetEnvironmentValue(const std::string& name) { return EnvironmentValue(name); }

std::string WindowsFolder() {
    std::string folder = GetEnvironmentValue("WINDIR");
    return folder.empty() ? SystemWindowsFolder() : folder;
}

std::string GetReportFolder() { return GetSpecialFolderPath(0); }
