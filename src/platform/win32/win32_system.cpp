// Environment, shell folders, processes, the current folder and files, on the Win32 "A" functions.
#include "platform/win32/win32_internal.h"

#include <shellapi.h>
#include <shlobj.h>

#include <map>
#include <set>
#include <vector>

namespace {

HANDLE ToFile(Handle file) { return reinterpret_cast<HANDLE>(file); }

Handle FromFile(HANDLE file) { return file == INVALID_HANDLE_VALUE ? 0 : reinterpret_cast<Handle>(file); }

std::set<Handle> FailedReads;  // open files a read failed on

// A file taken for a rewrite: held open with a lock on one byte far past the end of any catalogue,
// since a Windows lock keeps readers out of the bytes it covers. verrant-cli locks the same byte.
struct ClaimedFile {
    HANDLE file = INVALID_HANDLE_VALUE;
    std::string target;  // the file itself, links followed
    DWORD attributes = 0;
};
const DWORD ClaimLockOffset = 0x7FFFFFFE;
std::map<Handle, ClaimedFile> Claims;
std::map<Handle, std::string> Replacements;  // open replacements and their names

bool SameFile(HANDLE file, const BY_HANDLE_FILE_INFORMATION& known) {
    BY_HANDLE_FILE_INFORMATION information;
    return GetFileInformationByHandle(file, &information) &&
           information.dwVolumeSerialNumber == known.dwVolumeSerialNumber &&
           information.nFileIndexHigh == known.nFileIndexHigh &&
           information.nFileIndexLow == known.nFileIndexLow;
}

// Whether the name still names the file, not one that a finished rewrite put there meanwhile.
bool NameStillNames(const std::string& name, const BY_HANDLE_FILE_INFORMATION& known) {
    HANDLE again = CreateFileA(name.c_str(), 0, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
                               nullptr, OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL, nullptr);
    if (again == INVALID_HANDLE_VALUE) return false;
    bool same = SameFile(again, known);
    CloseHandle(again);
    return same;
}

std::string FinalPathOf(HANDLE file, const std::string& name) {
    char path[MAX_PATH] = "";
    DWORD length = GetFinalPathNameByHandleA(file, path, sizeof path, FILE_NAME_NORMALIZED | VOLUME_NAME_DOS);
    if (length == 0 || length >= sizeof path) return name;
    std::string final(path, length);
    if (final.rfind("\\\\?\\", 0) == 0 && final.size() > 6 && final[5] == ':') final.erase(0, 4);
    return final;
}

// A desktop whose path does not fit the 260 characters of the "A" functions: its whole path, which no
// file operation can then use, so a report is refused rather than written elsewhere.
std::string LongShellPath(PCIDLIST_ABSOLUTE items) {
    std::vector<wchar_t> wide(32768);
    if (!SHGetPathFromIDListEx(items, wide.data(), static_cast<DWORD>(wide.size()), GPFIDL_DEFAULT))
        return "";
    int length = WideCharToMultiByte(CP_ACP, 0, wide.data(), -1, nullptr, 0, nullptr, nullptr);
    if (length <= 1) return "";
    std::string path(static_cast<std::size_t>(length), '\0');
    WideCharToMultiByte(CP_ACP, 0, wide.data(), -1, path.data(), length, nullptr, nullptr);
    path.resize(static_cast<std::size_t>(length) - 1);
    return path;
}

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
    char path[MAX_PATH] = "";
    std::string folder = SHGetPathFromIDListA(items, path) ? std::string(path) : LongShellPath(items);
    CoTaskMemFree(items);
    return folder;
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

// Opened where it is, never through a link, and only a file on a disk: a device or a pipe is no report.
Handle CreateForWriting(const std::string& name) {
    HANDLE file = CreateFileA(name.c_str(), GENERIC_WRITE, FILE_SHARE_READ, nullptr, OPEN_ALWAYS,
                              FILE_ATTRIBUTE_NORMAL | FILE_FLAG_OPEN_REPARSE_POINT, nullptr);
    if (file == INVALID_HANDLE_VALUE) return 0;
    BY_HANDLE_FILE_INFORMATION information;
    // A second name of a file (a hard link) is as much a planted link as a reparse point.
    if (GetFileType(file) != FILE_TYPE_DISK || !GetFileInformationByHandle(file, &information) ||
        (information.dwFileAttributes & (FILE_ATTRIBUTE_DIRECTORY | FILE_ATTRIBUTE_REPARSE_POINT)) ||
        information.nNumberOfLinks > 1 || !SetEndOfFile(file)) {
        CloseHandle(file);
        return 0;
    }
    return FromFile(file);
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
    Replacements.erase(file);
    return file != 0 && CloseHandle(ToFile(file));
}

bool RemoveFile(const std::string& name) {
    DWORD attributes = GetFileAttributesA(name.c_str());
    if (attributes == INVALID_FILE_ATTRIBUTES ||
        (attributes & (FILE_ATTRIBUTE_DIRECTORY | FILE_ATTRIBUTE_REPARSE_POINT)))
        return false;
    return DeleteFileA(name.c_str()) != FALSE;
}

//--- rewriting a file in place

// Readers, writers and the final replacement may share the file; only a second claim is kept out.
FileClaim ClaimForRewrite(const std::string& name, Handle& claim) {
    claim = 0;
    HANDLE file =
        CreateFileA(name.c_str(), GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
                    nullptr, OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL, nullptr);
    if (file == INVALID_HANDLE_VALUE) return FileClaim::NotOpened;
    BY_HANDLE_FILE_INFORMATION information;
    OVERLAPPED lockByte = {};
    lockByte.Offset = ClaimLockOffset;
    FileClaim result = FileClaim::Taken;
    if (!GetFileInformationByHandle(file, &information) ||
        (information.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY))
        result = FileClaim::NotOpened;
    else if (information.dwFileAttributes & FILE_ATTRIBUTE_READONLY)
        result = FileClaim::ReadOnly;
    else if (!LockFileEx(file, LOCKFILE_EXCLUSIVE_LOCK | LOCKFILE_FAIL_IMMEDIATELY, 0, 1, 0, &lockByte) ||
             !NameStillNames(name, information))
        result = FileClaim::Busy;
    if (result != FileClaim::Taken) {
        CloseHandle(file);
        return result;
    }
    claim = FromFile(file);
    Claims[claim] = {file, FinalPathOf(file, name), information.dwFileAttributes};
    return result;
}

// CREATE_NEW takes no existing file and follows no link. Sharing only reading keeps other writers out;
// sharing deletion lets the file move into place while still open, so no other file takes its name
// in between.
Handle CreateReplacement(Handle claim, const std::string& name) {
    auto claimed = Claims.find(claim);
    if (claimed == Claims.end()) return 0;
    DWORD kept = claimed->second.attributes & (FILE_ATTRIBUTE_HIDDEN | FILE_ATTRIBUTE_SYSTEM |
                                               FILE_ATTRIBUTE_ARCHIVE | FILE_ATTRIBUTE_NOT_CONTENT_INDEXED);
    HANDLE file = CreateFileA(name.c_str(), GENERIC_WRITE, FILE_SHARE_READ | FILE_SHARE_DELETE, nullptr,
                              CREATE_NEW, kept != 0 ? kept : FILE_ATTRIBUTE_NORMAL, nullptr);
    if (file == INVALID_HANDLE_VALUE) return 0;
    Replacements[FromFile(file)] = name;
    return FromFile(file);
}

// Windows replaces no file that is open: the claim ends just before the replacement moves in.
bool ReplaceClaimedFile(Handle claim, Handle replacement) {
    auto claimed = Claims.find(claim);
    auto named = Replacements.find(replacement);
    if (claimed == Claims.end() || named == Replacements.end()) return false;
    std::string target = claimed->second.target, source = named->second;
    bool flushed = FlushFileBuffers(ToFile(replacement)) != FALSE;
    ReleaseClaim(claim);
    bool moved = flushed && MoveFileExA(source.c_str(), target.c_str(),
                                        MOVEFILE_REPLACE_EXISTING | MOVEFILE_WRITE_THROUGH) != FALSE;
    return CloseFile(replacement) && moved;
}

void ReleaseClaim(Handle claim) {
    auto claimed = Claims.find(claim);
    if (claimed == Claims.end()) return;
    OVERLAPPED lockByte = {};
    lockByte.Offset = ClaimLockOffset;
    UnlockFileEx(claimed->second.file, 0, 1, 0, &lockByte);
    CloseHandle(claimed->second.file);
    Claims.erase(claimed);
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
    // Anything but the end of the listing leaves it incomplete.
    bool complete = GetLastError() == ERROR_NO_MORE_FILES;
    FindClose(search);
    return complete;
}
