// Files and folders on the host's file system. Program paths use "\" and are turned into host
// paths here. Names are matched as Windows matches them: a path component with no exact match
// takes the entry whose name is the same without regard to ASCII letter case.
#include "platform/headless/headless.h"

#include <sys/stat.h>

#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <map>
#include <system_error>
#ifdef _WIN32
#include <io.h>
#else
#include <unistd.h>
#endif

namespace fs = std::filesystem;

namespace {

struct OpenFile {
    std::FILE* stream = nullptr;
    std::string bareName;
    long long written = 0;
    long long read = 0;
    bool readFailed = false;
};

std::map<Handle, OpenFile> Files;
Handle LastFileHandle = 0;
std::string Current;  // program path of the current folder, no trailing "\"
HeadlessFileFaults Faults;
HeadlessFileCounters Counters;

char LowerAscii(char c) { return (c >= 'A' && c <= 'Z') ? static_cast<char>(c - 'A' + 'a') : c; }

bool SameIgnoringCase(const std::string& a, const std::string& b) {
    if (a.size() != b.size()) return false;
    for (std::size_t i = 0; i < a.size(); ++i)
        if (LowerAscii(a[i]) != LowerAscii(b[i])) return false;
    return true;
}

char UpperAscii(char c) { return (c >= 'a' && c <= 'z') ? static_cast<char>(c - 'a' + 'A') : c; }

// As NTFS orders names: by their upper case, so "_" and "[" come after the letters.
bool LessIgnoringCase(const std::string& a, const std::string& b) {
    std::size_t n = std::min(a.size(), b.size());
    for (std::size_t i = 0; i < n; ++i) {
        unsigned char x = static_cast<unsigned char>(UpperAscii(a[i]));
        unsigned char y = static_cast<unsigned char>(UpperAscii(b[i]));
        if (x != y) return x < y;
    }
    if (a.size() != b.size()) return a.size() < b.size();
    return a < b;
}

bool IsAbsoluteProgramPath(const std::string& path) {
    return (!path.empty() && path[0] == '\\') || (path.size() >= 2 && path[1] == ':');
}

std::string BareName(const std::string& programPath) {
    std::size_t slash = programPath.find_last_of("\\/");
    return slash == std::string::npos ? programPath : programPath.substr(slash + 1);
}

std::string FullProgramPath(const std::string& path) {
    if (IsAbsoluteProgramPath(path)) return path;
    return Current + "\\" + path;
}

bool Exists(const std::string& hostPath) {
    std::error_code error;
    return fs::exists(fs::path(hostPath), error);
}

// The host path of a program path, each missing component replaced by a case-insensitive match.
std::string ResolveHost(const std::string& programPath) {
    std::string host = HeadlessHostPath(FullProgramPath(programPath));
    if (Exists(host)) return host;
    std::string resolved;
    std::size_t start = 0;
    if (!host.empty() && host[0] == '/') {
        resolved = "/";
        start = 1;
    }
    while (start <= host.size()) {
        std::size_t end = host.find('/', start);
        if (end == std::string::npos) end = host.size();
        std::string component = host.substr(start, end - start);
        start = end + 1;
        if (component.empty()) continue;
        std::string candidate = resolved.empty() || resolved.back() == '/' ? resolved + component
                                                                           : resolved + "/" + component;
        if (!Exists(candidate) && component != "." && component != "..") {
            std::string best;
            std::error_code error;
            for (fs::directory_iterator it(resolved.empty() ? "." : resolved, error), last; !error && it != last;
                 it.increment(error)) {
                std::string name = it->path().filename().string();
                if (SameIgnoringCase(name, component) && (best.empty() || LessIgnoringCase(name, best)))
                    best = name;
            }
            if (!best.empty())
                candidate = resolved.empty() || resolved.back() == '/' ? resolved + best : resolved + "/" + best;
        }
        resolved = candidate;
    }
    return resolved;
}

bool IsRegularFile(const std::string& hostPath) {
    std::error_code error;
    return fs::is_regular_file(fs::path(hostPath), error);
}

bool IsFolder(const std::string& hostPath) {
    std::error_code error;
    return fs::is_directory(fs::path(hostPath), error);
}

Handle Remember(std::FILE* stream, const std::string& name) {
    OpenFile file;
    file.stream = stream;
    file.bareName = BareName(name);
    Files[++LastFileHandle] = file;
    return LastFileHandle;
}

OpenFile* FindFile(Handle handle) {
    auto it = Files.find(handle);
    return it == Files.end() ? nullptr : &it->second;
}

// Windows patterns: "*" any run, "?" one character, letters without regard to case; "*.*" is all.
bool MatchesPattern(const std::string& name, const std::string& pattern) {
    if (pattern == "*.*" || pattern == "*") return true;
    std::size_t n = 0, p = 0, starP = std::string::npos, starN = 0;
    while (n < name.size()) {
        if (p < pattern.size() && (pattern[p] == '?' || LowerAscii(pattern[p]) == LowerAscii(name[n]))) {
            ++n;
            ++p;
        } else if (p < pattern.size() && pattern[p] == '*') {
            starP = p++;
            starN = n;
        } else if (starP != std::string::npos) {
            p = starP + 1;
            n = ++starN;
        } else {
            return false;
        }
    }
    while (p < pattern.size() && pattern[p] == '*') ++p;
    return p == pattern.size();
}

}  // namespace

void HeadlessResetFiles() {
    for (auto& entry : Files) std::fclose(entry.second.stream);
    Files.clear();
    std::error_code error;
    Current = HeadlessProgramPath(fs::current_path(error).string());
    Faults = HeadlessFileFaults();
    Counters = HeadlessFileCounters();
}

std::string HeadlessHostPath(const std::string& programPath) {
    std::string host = programPath;
    std::replace(host.begin(), host.end(), '\\', '/');
    return host;
}

std::string HeadlessProgramPath(const std::string& hostPath) {
    std::error_code error;
    std::string path = fs::absolute(fs::path(hostPath), error).lexically_normal().string();
    std::replace(path.begin(), path.end(), '/', '\\');
    while (path.size() > 1 && path.back() == '\\' && !(path.size() == 3 && path[1] == ':')) path.pop_back();
    return path;
}

void HeadlessSetFileFaults(const HeadlessFileFaults& faults) { Faults = faults; }
HeadlessFileCounters HeadlessCounters() { return Counters; }

bool MakeFolderCurrent(const std::string& folder) {
    if (folder.empty()) return false;
    std::string full = FullProgramPath(folder);
    if (!IsFolder(ResolveHost(full))) return false;
    while (full.size() > 1 && full.back() == '\\') full.pop_back();
    Current = full;
    return true;
}

std::string CurrentFolder() { return Current; }

Handle OpenForReading(const std::string& name) {
    ++Counters.opens;
    if (!Faults.failOpen.empty() && SameIgnoringCase(BareName(name), Faults.failOpen)) return 0;
    std::string host = ResolveHost(name);
    if (!IsRegularFile(host)) return 0;
    std::FILE* stream = std::fopen(host.c_str(), "rb");
    return stream ? Remember(stream, name) : 0;
}

Handle CreateForWriting(const std::string& name) {
    if (!Faults.failCreate.empty() && SameIgnoringCase(BareName(name), Faults.failCreate)) return 0;
    std::string host = ResolveHost(name);
    if (IsFolder(host)) return 0;
    std::FILE* stream = std::fopen(host.c_str(), "wb");
    return stream ? Remember(stream, name) : 0;
}

std::size_t FileSizeOf(Handle handle) {
    OpenFile* file = FindFile(handle);
    struct stat status {};
    if (!file || fstat(fileno(file->stream), &status) != 0) return 0;
    return static_cast<std::size_t>(status.st_size);
}

std::size_t ReadBytes(Handle handle, char* buffer, std::size_t size) {
    OpenFile* file = FindFile(handle);
    if (!file || file->readFailed) return 0;
    if (Faults.failReadAfterBytes >= 0 && SameIgnoringCase(file->bareName, Faults.failReadName) &&
        file->read + static_cast<long long>(size) > Faults.failReadAfterBytes) {
        size = static_cast<std::size_t>(std::max(0LL, Faults.failReadAfterBytes - file->read));
        file->readFailed = size == 0;
    }
    std::size_t done = std::fread(buffer, 1, size, file->stream);
    file->read += static_cast<long long>(done);
    if (std::ferror(file->stream)) file->readFailed = true;
    return done;
}

bool ReadHasFailed(Handle handle) {
    OpenFile* file = FindFile(handle);
    return file && file->readFailed;
}

bool WriteBytes(Handle handle, const char* data, std::size_t size) {
    OpenFile* file = FindFile(handle);
    if (!file) return false;
    std::size_t allowed = size;
    bool injected = false;
    if (Faults.failWriteAfterBytes >= 0 && SameIgnoringCase(file->bareName, Faults.failWriteName) &&
        file->written + static_cast<long long>(size) > Faults.failWriteAfterBytes) {
        allowed = static_cast<std::size_t>(std::max(0LL, Faults.failWriteAfterBytes - file->written));
        injected = true;
    }
    std::size_t done = std::fwrite(data, 1, allowed, file->stream);
    file->written += static_cast<long long>(done);
    return !injected && done == size;
}

bool FlushToDisk(Handle handle) {
    OpenFile* file = FindFile(handle);
    if (!file || std::fflush(file->stream) != 0) return false;
#ifdef _WIN32
    return _commit(_fileno(file->stream)) == 0;
#else
    return fsync(fileno(file->stream)) == 0;
#endif
}

bool CloseFile(Handle handle) {
    auto it = Files.find(handle);
    if (it == Files.end()) return false;
    bool closed = std::fclose(it->second.stream) == 0;
    Files.erase(it);
    return closed;
}

bool RemoveFile(const std::string& name) {
    if (Faults.failRemove) return false;
    std::string host = ResolveHost(name);
    if (!IsRegularFile(host)) return false;
    std::error_code error;
    return fs::remove(fs::path(host), error);
}

bool ReplaceFileWith(const std::string& target, const std::string& source) {
    if (Faults.failReplace) return false;
    std::string from = ResolveHost(source);
    if (!IsRegularFile(from)) return false;
    std::error_code error;
    fs::rename(fs::path(from), fs::path(ResolveHost(target)), error);
    return !error;
}

bool ListFolder(const std::string& pattern, std::vector<FolderEntry>& entries) {
    ++Counters.listings;
    entries.clear();
    std::size_t slash = pattern.rfind('\\');
    std::string folder = slash == std::string::npos ? Current
                         : slash == 0                ? std::string(1, '\\')
                                                     : pattern.substr(0, slash);
    std::string filter = slash == std::string::npos ? pattern : pattern.substr(slash + 1);
    std::string host = ResolveHost(folder);
    if (!IsFolder(host)) return false;
    std::error_code error;
    std::vector<FolderEntry> found;
    for (fs::directory_iterator it(host, error), last; !error && it != last; it.increment(error)) {
        FolderEntry entry;
        entry.name = it->path().filename().string();
        std::error_code kindError;
        entry.isFolder = it->is_directory(kindError);
        if (MatchesPattern(entry.name, filter)) found.push_back(entry);
    }
    if (error) return false;
    std::sort(found.begin(), found.end(),
              [](const FolderEntry& a, const FolderEntry& b) { return LessIgnoringCase(a.name, b.name); });
    if (MatchesPattern(".", filter)) entries.push_back({".", true});
    if (MatchesPattern("..", filter)) entries.push_back({"..", true});
    entries.insert(entries.end(), found.begin(), found.end());
    return true;
}
