// Environment, shell folders, processes, the current folder and files, on the Win32 "A" functions.
#include "platform/win32/win32_internal.h"

#include <shellapi.h>
#include <shlobj.h>

#include <set>

namespace {

HANDLE ToFile(Handle file) { return reinterpret_cast<HANDLE>(file); }

Handle FromFile(HANDLE file) { return file == INVALID_HANDLE_VALUE ? 0 : reinterpret_cast<Handle>(file); }

std::set<Handle> FailedReads;  // open files a read failed on

// ReadFile and WriteFile take 32-bit counts.
DWORD Chunk(std::size_t size) { return size > 0x40000000u ? 0x40000000u : static_cast<DWORD>(size); }

}  // namespace

//--- environment and shell folders

std::string EnvironmentValue(const std::string& name) {
    std::string value(256, '\0');
    for (;;) {
        DWORD length = GetEnvironmentVariableA(name.c_str(), value.data(), static_cast<DWORD>(value.size()));
        if (length < value.size()) {
            value.resize(length);  // 0 when unset
            return value;
        }
        value.assign(length, '\0');  // too small: length is the size needed, NUL included
    }
}

std::string SystemWindowsFolder() {
    char folder[MAX_PATH + 1] = "";
    UINT length = GetWindowsDirectoryA(folder, sizeof folder);
    return length < sizeof folder ? std::string(folder, length) : std::string();
}

std::string SystemDriveName() { return SystemWindowsFolder().substr(0, 2); }

std::string ShellFolderPath(int folderId) {
    LPITEMIDLIST items = nullptr;
    if (FAILED(SHGetSpecialFolderLocation(nullptr, folderId, &items)) || items == nullptr) return "";
    char path[260] = "";
    BOOL converted = SHGetPathFromIDListA(items, path);
    CoTaskMemFree(items);
    return converted ? std::string(path) : std::string();
}

std::string DesktopFolderPath() {
    std::string path = ShellFolderPath(0);
    if (!path.empty() && path.back() != '\\') path += '\\';
    return path;
}

//--- processes

bool StartProcess(const std::string& commandLine, const std::string& workingFolder) {
    std::string line = commandLine;  // CreateProcessA may write into its command line
    STARTUPINFOA startup = {};
    startup.cb = sizeof startup;
    startup.dwFlags = STARTF_USESHOWWINDOW;
    startup.wShowWindow = SW_SHOWNORMAL;
    PROCESS_INFORMATION process = {};
    if (!CreateProcessA(nullptr, line.data(), nullptr, nullptr, FALSE, 0, nullptr,
                        workingFolder.empty() ? nullptr : workingFolder.c_str(), &startup, &process))
        return false;
    CloseHandle(process.hThread);
    CloseHandle(process.hProcess);
    return true;
}

bool ShellExecuteOpen(const std::string& file, const std::string& parameters,
                      const std::string& workingFolder) {
    HINSTANCE result = ShellExecuteA(nullptr, "open", file.c_str(), parameters.c_str(),
                                     workingFolder.empty() ? nullptr : workingFolder.c_str(), SW_SHOWNORMAL);
    return reinterpret_cast<INT_PTR>(result) > 32;
}

//--- current folder and files

bool MakeFolderCurrent(const std::string& folder) {
    return !folder.empty() && SetCurrentDirectoryA(folder.c_str());
}

std::string CurrentFolder() {
    std::string folder(MAX_PATH, '\0');
    for (;;) {
        DWORD length = GetCurrentDirectoryA(static_cast<DWORD>(folder.size()), folder.data());
        if (length < folder.size()) {
            folder.resize(length);
            return folder;
        }
        folder.assign(length, '\0');
    }
}

Handle OpenForReading(const std::string& name) {
    HANDLE file = CreateFileA(name.c_str(), GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE, nullptr,
                              OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL, nullptr);
    if (file == INVALID_HANDLE_VALUE) return 0;
    BY_HANDLE_FILE_INFORMATION information;
    if (!GetFileInformationByHandle(file, &information) ||
        (information.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY)) {
        CloseHandle(file);  // a folder is no file to read
        return 0;
    }
    return FromFile(file);
}

Handle CreateForWriting(const std::string& name) {
    return FromFile(CreateFileA(name.c_str(), GENERIC_WRITE, FILE_SHARE_READ, nullptr, CREATE_ALWAYS,
                                FILE_ATTRIBUTE_NORMAL, nullptr));
}

std::size_t FileSizeOf(Handle file) {
    LARGE_INTEGER size;
    if (!GetFileSizeEx(ToFile(file), &size)) return 0;
    return static_cast<std::size_t>(size.QuadPart);
}

std::size_t ReadBytes(Handle file, char* buffer, std::size_t size) {
    if (ReadHasFailed(file)) return 0;
    std::size_t total = 0;
    while (total < size) {
        DWORD done = 0;
        if (!ReadFile(ToFile(file), buffer + total, Chunk(size - total), &done, nullptr)) {
            FailedReads.insert(file);
            break;
        }
        if (done == 0) break;
        total += done;
    }
    return total;
}

bool WriteBytes(Handle file, const char* data, std::size_t size) {
    std::size_t total = 0;
    while (total < size) {
        DWORD done = 0;
        if (!WriteFile(ToFile(file), data + total, Chunk(size - total), &done, nullptr) || done == 0)
            return false;
        total += done;
    }
    return true;
}

bool FlushToDisk(Handle file) { return FlushFileBuffers(ToFile(file)) != FALSE; }

bool ReadHasFailed(Handle file) { return FailedReads.count(file) != 0; }

bool CloseFile(Handle file) {
    FailedReads.erase(file);
    return file != 0 && CloseHandle(ToFile(file));
}

bool RemoveFile(const std::string& name) { return DeleteFileA(name.c_str()) != FALSE; }

bool ReplaceFileWith(const std::string& target, const std::string& source) {
    return MoveFileExA(source.c_str(), target.c_str(), MOVEFILE_REPLACE_EXISTING | MOVEFILE_WRITE_THROUGH) !=
           FALSE;
}

bool ListFolder(const std::string& pattern, std::vector<FolderEntry>& entries) {
    entries.clear();
    WIN32_FIND_DATAA found;
    HANDLE search = FindFirstFileA(pattern.c_str(), &found);
    if (search == INVALID_HANDLE_VALUE)
        return GetLastError() == ERROR_FILE_NOT_FOUND;  // a folder with no match
    do {
        FolderEntry entry;
        entry.name = found.cFileName;
        entry.isFolder = (found.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
        entries.push_back(entry);
    } while (FindNextFileA(search, &found));
    FindClose(search);
    return true;
}
