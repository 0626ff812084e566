// Files and folders on the host's file system. Program paths use "\" and are turned into host
// paths here, read as Windows reads them: "." and ".." by their text, not on the disk, and a path
// component with no exact match takes the entry whose name is the same without regard to ASCII
// letter case.
#include "platform/headless/headless.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>
#include <filesystem>
#include <map>
#include <string_view>
#include <system_error>
#include <unordered_map>
#ifdef _WIN32
#include <io.h>
#include <share.h>
#include <sys/locking.h>
#else
#include <dirent.h>
#include <sys/file.h>
#include <unistd.h>
#endif

namespace fs = std::filesystem;

namespace {

struct OpenFile {
    int descriptor = -1;
    std::string bareName;
    std::string hostPath;
    long long written = 0;
    long long read = 0;
    bool readFailed = false;
};

// A file taken for a rewrite, held open and locked while the claim lasts.
struct ClaimedFile {
    int descriptor = -1;
    std::string target;  // host path of the file itself, links followed
    struct stat status {};
};

// The names in a folder by their lowered form, as listed after the folder's last change.
struct FolderNames {
    fs::file_time_type changed;
    std::unordered_map<std::string, std::string> byLowered;  // the first in the Windows order wins
};

std::map<Handle, OpenFile> Files;
std::map<Handle, ClaimedFile> Claims;
Handle LastFileHandle = 0;
std::string Current;  // program path of the current folder, no trailing "\"
HeadlessFileFaults Faults;
HeadlessFileCounters Counters;
std::unordered_map<std::string, FolderNames> CaseListings;    // host folder -> its names
std::unordered_map<std::string, std::string> MatchedFolders;  // textual host folder -> the one it matched
std::string LastFailure;  // "host path: reason" when the latest file operation failed
const char* const InjectedFault = "fault injected";
const char* const NotPlainFile = "not a plain file";
const char* const ReadOnlyFile = "read-only";
const char* const ClaimedElsewhere = "being rewritten by another run";

char LowerAscii(char c) { return (c >= 'A' && c <= 'Z') ? static_cast<char>(c - 'A' + 'a') : c; }

std::string Lowered(std::string_view text) {
    std::string lowered(text);
    for (char& c : lowered) c = LowerAscii(c);
    return lowered;
}

bool SameIgnoringCase(const std::string& a, const std::string& b) {
    return a.size() == b.size() && Lowered(a) == Lowered(b);
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

bool IsInjected(const std::string& faultName, const std::string& name) {
    return !faultName.empty() && SameIgnoringCase(BareName(name), faultName);
}

std::string FullProgramPath(const std::string& path) {
    if (IsAbsoluteProgramPath(path)) return path;
    return Current + "\\" + path;
}

std::string SystemReason(int error = errno) { return std::generic_category().message(error); }

// Keeps why an operation on the host path failed, for verrant-cli; gives what a failure gives.
bool Failed(const std::string& host, const std::string& reason) {
    LastFailure = host + ": " + reason;
    return false;
}

FileClaim Refused(const std::string& host, const std::string& reason, FileClaim result) {
    Failed(host, reason);
    return result;
}

bool Succeeded() {
    LastFailure.clear();
    return true;
}

bool Exists(const std::string& hostPath) {
    std::error_code error;
    return fs::exists(fs::path(hostPath), error);
}

bool IsFolder(const std::string& hostPath) {
    std::error_code error;
    return fs::is_directory(fs::path(hostPath), error);
}

// Why the host path is no folder: missing, or something else.
std::string NoFolderReason(const std::string& hostPath) {
    std::error_code error;
    fs::file_status status = fs::status(fs::path(hostPath), error);
    return fs::exists(status) ? SystemReason(ENOTDIR) : error ? error.message() : SystemReason(ENOENT);
}

std::size_t RootLength(const std::string& host) {
    if (host.rfind("//", 0) == 0) return 2;
    if (host.rfind('/', 0) == 0) return 1;
    return host.size() >= 3 && host[1] == ':' && host[2] == '/' ? 3 : 0;
}

// The host path of a program path with "." and ".." taken by their text, as Windows takes them, so
// that no part of it needs the disk; linear in its parts.
std::string TextualHostPath(const std::string& programPath) {
    // One copy of the path, as every open and listing comes through here.
    std::string host;
    if (!IsAbsoluteProgramPath(programPath)) {
        host.reserve(Current.size() + 1 + programPath.size());
        host.append(Current).append(1, '\\');
    }
    host += programPath;
    std::replace(host.begin(), host.end(), '\\', '/');
    const std::size_t rootLength = RootLength(host);
    // Most paths have no part to take out: they are their own textual path.
    std::string_view rest = std::string_view(host).substr(rootLength);
    if (!rest.empty() && rest.front() != '.' && rest.back() != '/' && rest.back() != '.' &&
        rest.find("//") == std::string_view::npos && rest.find("/.") == std::string_view::npos)
        return host;
    std::vector<std::string_view> parts;
    for (std::size_t start = rootLength; start < host.size();) {
        std::size_t end = std::min(host.find('/', start), host.size());
        std::string_view part(host.data() + start, end - start);
        start = end + 1;
        if (part.empty() || part == ".") continue;
        if (part != "..")
            parts.push_back(part);
        else if (!parts.empty() && parts.back() != "..")
            parts.pop_back();
        else if (rootLength == 0)
            parts.push_back(part);  // above a relative path's start; a root stays
    }
    std::string path = host.substr(0, rootLength);
    for (std::string_view part : parts) {
        if (!path.empty() && path.back() != '/') path += '/';
        path += part;
    }
    return path;
}

// The name in the host folder that is the part without regard to ASCII letter case, "" when none.
// A folder is listed for this once, and again only after it changed.
std::string CaseMatch(const std::string& folder, std::string_view part) {
    std::error_code error;
    fs::file_time_type changed = fs::last_write_time(folder, error);
    if (error) return "";
    auto [it, added] = CaseListings.try_emplace(folder);
    FolderNames& names = it->second;
    if (added || names.changed != changed) {
        ++Counters.caseListings;
        names.changed = changed;
        names.byLowered.clear();
        for (fs::directory_iterator entry(folder, error), last; !error && entry != last;
             entry.increment(error)) {
            std::string name = entry->path().filename().string();
            auto [known, fresh] = names.byLowered.try_emplace(Lowered(name), name);
            if (!fresh && LessIgnoringCase(name, known->second)) known->second = name;
        }
    }
    auto found = names.byLowered.find(Lowered(part));
    return found == names.byLowered.end() ? "" : found->second;
}

// What the program's own writes may change: the listings kept for letter case.
void ForgetListings() {
    CaseListings.clear();
    MatchedFolders.clear();
}

// The name in the host folder in the letters it has there: the part itself when that is there.
std::string NameInFolder(const std::string& folder, std::string_view part) {
    std::string path = folder + "/";
    path += part;
    if (Exists(path)) return path;
    std::string match = CaseMatch(folder, part);
    return match.empty() ? path : folder + "/" + match;
}

// A textual host path with each missing part replaced by the entry that matches it in another letter
// case. Part by part up to the first part that nothing matches, as nothing is below a missing folder;
// a folder matched once is taken again while it is there, and the walk starts below the nearest one.
std::string MatchLetterCase(const std::string& path) {
    const std::size_t rootLength = RootLength(path);
    const std::size_t slash = path.rfind('/');
    const std::string parent = slash > rootLength && slash != std::string::npos ? path.substr(0, slash) : "";
    auto known = MatchedFolders.find(parent);
    if (known != MatchedFolders.end() && IsFolder(known->second))
        return NameInFolder(known->second, std::string_view(path).substr(slash + 1));
    std::string matched = path.substr(0, rootLength);
    std::size_t start = rootLength;
    for (std::size_t end = parent.empty() ? 0 : parent.rfind('/');
         end != std::string::npos && end > rootLength; end = path.rfind('/', end - 1)) {
        auto above = MatchedFolders.find(path.substr(0, end));
        if (above == MatchedFolders.end()) continue;
        if (IsFolder(above->second)) {
            matched = above->second;
            start = end + 1;
        }
        break;
    }
    // Where each folder part ends, in path and in matched.
    std::vector<std::pair<std::size_t, std::size_t>> folders;
    while (start < path.size()) {
        std::size_t end = std::min(path.find('/', start), path.size());
        std::string_view part(path.data() + start, end - start);
        start = end + 1;
        std::string folder = matched.empty() ? "." : matched;
        std::size_t folderEnd = matched.size();
        if (!matched.empty() && matched.back() != '/') matched += '/';
        matched += part;
        if (!Exists(matched)) {
            std::string match = CaseMatch(folder, part);
            if (match.empty()) return matched + path.substr(std::min(end, path.size()));
            matched.resize(folderEnd);
            if (!matched.empty() && matched.back() != '/') matched += '/';
            matched += match;
        }
        if (end < path.size()) folders.emplace_back(end, matched.size());
    }
    for (auto [pathEnd, matchedEnd] : folders)
        if (pathEnd == parent.size() || path.compare(0, pathEnd, matched, 0, matchedEnd) != 0)
            MatchedFolders[path.substr(0, pathEnd)] = matched.substr(0, matchedEnd);
    return matched;
}

// The host path of a program path, found on the disk in any letter case where it can be.
std::string ResolveHost(const std::string& programPath) {
    std::string path = TextualHostPath(programPath);
    return Exists(path) ? path : MatchLetterCase(path);
}

// Opens the host file of a program path. The path as written is tried first; only when it is not
// there is it looked for in other letter cases.
int OpenHost(const std::string& programPath, int flags, std::string& host) {
    host = TextualHostPath(programPath);
    int descriptor = open(host.c_str(), flags, 0666);
    if (descriptor >= 0 || errno != ENOENT) return descriptor;
    // In a folder matched before, the name as written is what a match finds whenever it opens; only
    // when it does not are the folder and the name checked the long way.
    const std::size_t slash = host.rfind('/');
    auto known =
        slash == std::string::npos ? MatchedFolders.end() : MatchedFolders.find(host.substr(0, slash));
    if (known != MatchedFolders.end()) {
        std::string inKnown = known->second;
        inKnown.append(host, slash);
        descriptor = open(inKnown.c_str(), flags, 0666);
        if (descriptor >= 0) {
            host = std::move(inKnown);
            return descriptor;
        }
    }
    std::string matched = MatchLetterCase(host);
    if (matched == host) return descriptor;
    host = matched;
    return open(host.c_str(), flags, 0666);
}

OpenFile* FindFile(Handle handle) {
    auto it = Files.find(handle);
    return it == Files.end() ? nullptr : &it->second;
}

ClaimedFile* FindClaim(Handle handle) {
    auto it = Claims.find(handle);
    return it == Claims.end() ? nullptr : &it->second;
}

#ifdef _WIN32
// A folder's entries but "." and ".."; false when it cannot be listed, errno telling why.
bool ReadFolder(const std::string& host, std::vector<FolderEntry>& found) {
    std::error_code error;
    for (fs::directory_iterator it(host, error), last; !error && it != last; it.increment(error)) {
        std::error_code kindError;
        found.push_back({it->path().filename().string(), it->is_directory(kindError)});
    }
    if (error) errno = error.value();
    return !error;
}

// Windows has no links or pipes to fear here.
const int ReadFlags = O_RDONLY | O_BINARY;
const int WriteFlags = O_WRONLY | O_CREAT | O_BINARY;
// Beyond the end of any catalogue: Windows locks keep readers out of the bytes they cover.
const long ClaimLockOffset = 0x7FFFFFFE;

int FlushDescriptor(int descriptor) { return _commit(descriptor); }
int EmptyDescriptor(int descriptor) { return _chsize(descriptor, 0); }

int CreateExclusively(const std::string& host, const ClaimedFile&) {
    return _sopen(host.c_str(), _O_WRONLY | _O_CREAT | _O_EXCL | _O_BINARY, _SH_DENYWR, _S_IREAD | _S_IWRITE);
}

// Windows replaces no open file, so the name goes on naming the file held here.
FileClaim TakeClaim(const std::string& host, ClaimedFile& claimed) {
    claimed.descriptor = _sopen(host.c_str(), _O_RDONLY | _O_BINARY, _SH_DENYNO);
    claimed.target = host;
    if (claimed.descriptor < 0) return Refused(host, SystemReason(), FileClaim::NotOpened);
    if (fstat(claimed.descriptor, &claimed.status) != 0 || !S_ISREG(claimed.status.st_mode))
        return Refused(host, NotPlainFile, FileClaim::NotOpened);
    if (!(claimed.status.st_mode & _S_IWRITE)) return Refused(host, ReadOnlyFile, FileClaim::ReadOnly);
    if (_lseek(claimed.descriptor, ClaimLockOffset, SEEK_SET) != ClaimLockOffset ||
        _locking(claimed.descriptor, _LK_NBLCK, 1) != 0)
        return Refused(host, ClaimedElsewhere, FileClaim::Busy);
    return FileClaim::Taken;
}

void DropClaim(ClaimedFile& claimed) {
    if (claimed.descriptor < 0) return;
    if (_lseek(claimed.descriptor, ClaimLockOffset, SEEK_SET) == ClaimLockOffset)
        _locking(claimed.descriptor, _LK_UNLCK, 1);
    _close(claimed.descriptor);
    claimed.descriptor = -1;
}

// Windows replaces no file that is open, so the claim ends just before the replacement moves in.
bool MoveIntoPlace(const std::string& source, ClaimedFile& claimed) {
    DropClaim(claimed);
    std::error_code error;
    fs::rename(fs::path(source), fs::path(claimed.target), error);
    return !error || Failed(claimed.target, error.message());
}
#else
// The system's own listing: names and kinds come as they are, with no path made for each entry.
bool ReadFolder(const std::string& host, std::vector<FolderEntry>& found) {
    DIR* listing = opendir(host.c_str());
    if (!listing) return false;
    errno = 0;
    while (const dirent* entry = readdir(listing)) {
        std::string name = entry->d_name;
        if (name == "." || name == "..") continue;
        bool isFolder = entry->d_type == DT_DIR;
        if (entry->d_type == DT_LNK || entry->d_type == DT_UNKNOWN) isFolder = IsFolder(host + "/" + name);
        found.push_back({std::move(name), isFolder});
        errno = 0;
    }
    int error = errno;
    closedir(listing);
    errno = error;
    return error == 0;
}

// Opened without waiting, so a pipe cannot hang the program, and never through a link for writing.
const int ReadFlags = O_RDONLY | O_NONBLOCK | O_CLOEXEC;
const int WriteFlags = O_WRONLY | O_CREAT | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC;

int FlushDescriptor(int descriptor) { return fsync(descriptor); }
int EmptyDescriptor(int descriptor) { return ftruncate(descriptor, 0); }

// The owner first, since a change of owner may clear mode bits.
int CreateExclusively(const std::string& host, const ClaimedFile& claimed) {
    int descriptor = open(host.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0600);
    if (descriptor < 0) return descriptor;
    if (fchown(descriptor, claimed.status.st_uid, claimed.status.st_gid) != 0 &&
        fchown(descriptor, static_cast<uid_t>(-1), claimed.status.st_gid) != 0) {
        // Neither owner nor group is the runner's to give: the file stays the runner's own.
    }
    if (fchmod(descriptor, claimed.status.st_mode & 07777) == 0) return descriptor;
    int error = errno;
    close(descriptor);
    unlink(host.c_str());
    errno = error;
    return -1;
}

// A run that replaced the file between the open and the lock leaves this one holding the old file,
// which is no longer the catalogue: that run won.
FileClaim TakeClaim(const std::string& host, ClaimedFile& claimed) {
    claimed.descriptor = open(host.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
    if (claimed.descriptor < 0) return Refused(host, SystemReason(), FileClaim::NotOpened);
    struct stat now {};
    if (fstat(claimed.descriptor, &claimed.status) != 0 || !S_ISREG(claimed.status.st_mode))
        return Refused(host, NotPlainFile, FileClaim::NotOpened);
    if ((claimed.status.st_mode & 0222) == 0) return Refused(host, ReadOnlyFile, FileClaim::ReadOnly);
    if (flock(claimed.descriptor, LOCK_EX | LOCK_NB) != 0 || stat(host.c_str(), &now) != 0 ||
        now.st_ino != claimed.status.st_ino || now.st_dev != claimed.status.st_dev)
        return Refused(host, ClaimedElsewhere, FileClaim::Busy);
    std::error_code error;
    claimed.target = fs::canonical(fs::path(host), error).string();
    if (error) claimed.target = host;
    return FileClaim::Taken;
}

void DropClaim(ClaimedFile& claimed) {
    if (claimed.descriptor >= 0) close(claimed.descriptor);
    claimed.descriptor = -1;
}

// The claim holds on past the move, so no run takes the old file in the meantime.
bool MoveIntoPlace(const std::string& source, ClaimedFile& claimed) {
    return std::rename(source.c_str(), claimed.target.c_str()) == 0 || Failed(claimed.target, SystemReason());
}
#endif

// Holds a descriptor that must be a plain file, which a report created anew is emptied to.
Handle Remember(int descriptor, const std::string& name, std::string host, bool emptied) {
    struct stat status {};
    bool plain = fstat(descriptor, &status) == 0 && S_ISREG(status.st_mode);
    // A second name of a file is as much a planted link as a symbolic one: never written through.
    bool linked = plain && emptied && status.st_nlink > 1;
    if (!plain || linked || (emptied && EmptyDescriptor(descriptor) != 0)) {
        Failed(host, S_ISDIR(status.st_mode) ? SystemReason(EISDIR) : linked ? "a link" : NotPlainFile);
        close(descriptor);
        return 0;
    }
    OpenFile file;
    file.descriptor = descriptor;
    file.bareName = BareName(name);
    file.hostPath = std::move(host);
    Files.emplace_hint(Files.end(), ++LastFileHandle, std::move(file));
    Succeeded();
    return LastFileHandle;
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
    for (auto& entry : Files) close(entry.second.descriptor);
    Files.clear();
    for (auto& entry : Claims) DropClaim(entry.second);
    Claims.clear();
    ForgetListings();
    LastFailure.clear();
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

std::string HeadlessTakeFailure() {
    std::string failure;
    failure.swap(LastFailure);
    return failure;
}

bool MakeFolderCurrent(const std::string& folder) {
    if (folder.empty()) return false;
    std::string full = FullProgramPath(folder);
    std::string host = ResolveHost(full);
    if (!IsFolder(host)) return Failed(host, NoFolderReason(host));
    while (full.size() > 1 && full.back() == '\\') full.pop_back();
    Current = full;
    return Succeeded();
}

std::string CurrentFolder() { return Current; }

Handle OpenForReading(const std::string& name) {
    ++Counters.opens;
    std::string host;
    if (IsInjected(Faults.failOpen, name)) return Failed(ResolveHost(name), InjectedFault);
    int descriptor = OpenHost(name, ReadFlags, host);
    if (descriptor < 0) return Failed(host, SystemReason());
    return Remember(descriptor, name, std::move(host), false);
}

Handle CreateForWriting(const std::string& name) {
    std::string host = ResolveHost(name);
    if (IsInjected(Faults.failCreate, name)) return Failed(host, InjectedFault);
    ForgetListings();
    int descriptor = open(host.c_str(), WriteFlags, 0666);
    if (descriptor < 0) return Failed(host, errno == ELOOP ? "a link" : SystemReason().c_str());
    return Remember(descriptor, name, host, true);
}

std::size_t ReadBytes(Handle handle, char* buffer, std::size_t size) {
    OpenFile* file = FindFile(handle);
    if (!file || file->readFailed) return 0;
    bool injected = false;
    if (Faults.failReadAfterBytes >= 0 && SameIgnoringCase(file->bareName, Faults.failReadName) &&
        file->read + static_cast<long long>(size) > Faults.failReadAfterBytes) {
        size = static_cast<std::size_t>(std::max(0LL, Faults.failReadAfterBytes - file->read));
        injected = file->readFailed = size == 0;
    }
    std::size_t done = 0;
    while (done < size) {
        auto got = read(file->descriptor, buffer + done,
                        static_cast<unsigned>(std::min<std::size_t>(size - done, 1 << 30)));
        if (got < 0 && errno == EINTR) continue;
        if (got < 0) file->readFailed = true;
        if (got <= 0) break;
        done += static_cast<std::size_t>(got);
    }
    file->read += static_cast<long long>(done);
    if (file->readFailed)
        Failed(file->hostPath, injected ? InjectedFault : SystemReason().c_str());
    else
        LastFailure.clear();
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
    std::size_t done = 0;
    while (done < allowed) {
        auto put = write(file->descriptor, data + done,
                         static_cast<unsigned>(std::min<std::size_t>(allowed - done, 1 << 30)));
        if (put < 0 && errno == EINTR) continue;
        if (put <= 0) break;
        done += static_cast<std::size_t>(put);
    }
    file->written += static_cast<long long>(done);
    if (injected || done != size)
        return Failed(file->hostPath, injected ? InjectedFault : SystemReason().c_str());
    return Succeeded();
}

bool FlushToDisk(Handle handle) {
    OpenFile* file = FindFile(handle);
    if (!file) return false;
    return FlushDescriptor(file->descriptor) == 0 ? Succeeded() : Failed(file->hostPath, SystemReason());
}

// Closing and removing clean up after a failure already told, so they leave its reason alone.
bool CloseFile(Handle handle) {
    auto it = Files.find(handle);
    if (it == Files.end()) return false;
    bool closed = close(it->second.descriptor) == 0;
    if (!closed) Failed(it->second.hostPath, SystemReason());
    Files.erase(it);
    return closed;
}

bool RemoveFile(const std::string& name) {
    if (Faults.failRemove) return false;
    std::string host = ResolveHost(name);
    std::error_code error;
    if (!fs::is_regular_file(fs::symlink_status(fs::path(host), error))) return false;
    ForgetListings();
    return fs::remove(fs::path(host), error);
}

FileClaim ClaimForRewrite(const std::string& name, Handle& claim) {
    claim = 0;
    std::string host = ResolveHost(name);
    if (IsInjected(Faults.failOpen, name)) return Refused(host, InjectedFault, FileClaim::NotOpened);
    ClaimedFile claimed;
    FileClaim result = TakeClaim(host, claimed);
    if (result != FileClaim::Taken) {
        DropClaim(claimed);
        return result;
    }
    Claims[++LastFileHandle] = claimed;
    claim = LastFileHandle;
    Succeeded();
    return result;
}

Handle CreateReplacement(Handle claim, const std::string& name) {
    std::string host = ResolveHost(name);
    const ClaimedFile* claimed = FindClaim(claim);
    if (!claimed) return Failed(host, "no claim");
    if (IsInjected(Faults.failCreate, name)) return Failed(host, InjectedFault);
    ForgetListings();
    int descriptor = CreateExclusively(host, *claimed);
    if (descriptor < 0) return Failed(host, SystemReason());
    return Remember(descriptor, name, host, false);
}

bool ReplaceClaimedFile(Handle claim, Handle replacement) {
    ClaimedFile* claimed = FindClaim(claim);
    OpenFile* file = FindFile(replacement);
    if (!claimed || !file) return false;
    std::string source = file->hostPath;
    bool written = FlushDescriptor(file->descriptor) == 0 || Failed(source, SystemReason());
    if (!CloseFile(replacement) || !written) return false;
    if (Faults.failReplace) return Failed(claimed->target, InjectedFault);
    // As on Windows, where a file still open for reading is not replaced.
    for (const auto& [handle, open] : Files) {
        struct stat status {};
        if (fstat(open.descriptor, &status) == 0 && status.st_dev == claimed->status.st_dev &&
            status.st_ino == claimed->status.st_ino)
            return Failed(claimed->target, "still open for reading");
    }
    ForgetListings();
    return MoveIntoPlace(source, *claimed) && Succeeded();
}

void ReleaseClaim(Handle claim) {
    ClaimedFile* claimed = FindClaim(claim);
    if (!claimed) return;
    DropClaim(*claimed);
    Claims.erase(claim);
}

// The folder as written is listed first; only when it is not there is it looked for in other letter
// cases.
bool ListFolder(const std::string& pattern, std::vector<FolderEntry>& entries) {
    ++Counters.listings;
    entries.clear();
    std::size_t slash = pattern.rfind('\\');
    std::string folder = slash == std::string::npos ? Current
                         : slash == 0                ? std::string(1, '\\')
                                                     : pattern.substr(0, slash);
    std::string filter = slash == std::string::npos ? pattern : pattern.substr(slash + 1);
    std::string host = TextualHostPath(folder);
    if (MatchesPattern(".", filter)) entries.push_back({".", true});
    if (MatchesPattern("..", filter)) entries.push_back({"..", true});
    const auto dots = static_cast<std::ptrdiff_t>(entries.size());
    bool listed = ReadFolder(host, entries);
    if (!listed && errno == ENOENT) listed = ReadFolder(host = MatchLetterCase(host), entries);
    if (!listed) {
        const std::string reason = IsFolder(host) ? SystemReason() : NoFolderReason(host);
        entries.clear();
        return Failed(host, reason);
    }
    entries.erase(
        std::remove_if(entries.begin() + dots, entries.end(),
                       [&filter](const FolderEntry& entry) { return !MatchesPattern(entry.name, filter); }),
        entries.end());
    std::sort(entries.begin() + dots, entries.end(),
              [](const FolderEntry& a, const FolderEntry& b) { return LessIgnoringCase(a.name, b.name); });
    return Succeeded();
}
