#include "baselines.h"

#include "catalogue/catalogue_reader.h"
#include "catalogue/text.h"
#include "checks/mesh_references.h"

#include <algorithm>
#include <cstdio>
#include <cstring>
#include <dirent.h>
#include <fcntl.h>
#include <functional>
#include <set>
#include <string>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

namespace {

//--- reading, one byte at a time

std::FILE* OpenRead(const std::string& path) { return std::fopen(path.c_str(), "rb"); }

// Bytes up to CR, LF, NUL or the end; an LF after a CR goes with it.
bool ReadPhysicalLine(std::FILE* file, std::string& line) {
    line.clear();
    int c = getc_unlocked(file);
    if (c == EOF) return false;
    while (c != EOF && c != '\r' && c != '\n' && c != '\0') {
        line += static_cast<char>(c);
        c = getc_unlocked(file);
    }
    if (c == '\r') {
        int next = getc_unlocked(file);
        if (next != '\n' && next != EOF) ungetc(next, file);
    }
    return true;
}

bool ReadCatalogueLine(std::FILE* file, std::string& line) {
    if (!ReadPhysicalLine(file, line)) return false;
    line = std::string(TrimBlanks(line));
    return true;
}

bool Begins(const std::string& line, const char* prefix) { return line.compare(0, std::strlen(prefix), prefix) == 0; }

//--- writing

struct Report {
    std::FILE* file = nullptr;
    void Line(const std::string& text) {
        std::fwrite(text.data(), 1, text.size(), file);
        std::fwrite("\r\n", 1, 2, file);
    }
};

bool OpenReport(const BaselineInput& input, const char* name, Report& report) {
    report.file = std::fopen((input.reportFolder + "/" + name).c_str(), "wb");
    return report.file != nullptr;
}

// A heading, an empty line and the findings; no report at all without findings.
bool WriteFindings(const BaselineInput& input, const char* name, const char* heading,
                   const std::vector<std::string>& findings) {
    if (findings.empty()) return true;
    Report report;
    if (!OpenReport(input, name, report)) return false;
    report.Line(heading);
    report.Line("");
    for (const std::string& line : findings) report.Line(line);
    std::fclose(report.file);
    return true;
}

//--- the catalogue checks

// Every folder under the folder listed once, through the system's plain directory calls; with
// openFiles each other entry is also opened, checked for a plain file and closed, as the mesh search
// opens each mesh it finds.
long long ListFoldersBelow(const std::string& folder, bool openFiles) {
    DIR* listing = opendir(folder.c_str());
    if (!listing) return 0;
    long long entries = 0;
    std::vector<std::string> below;
    while (dirent* entry = readdir(listing)) {
        ++entries;
        std::string name = entry->d_name;
        if (name == "." || name == "..") continue;
        struct stat status {};
        bool isFolder = entry->d_type == DT_DIR ||
                        (entry->d_type == DT_UNKNOWN && lstat((folder + "/" + name).c_str(), &status) == 0 &&
                         S_ISDIR(status.st_mode));
        if (isFolder) {
            below.push_back(folder + "/" + name);
        } else if (openFiles) {
            int file = open((folder + "/" + name).c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC);
            if (file >= 0 && fstat(file, &status) == 0 && S_ISREG(status.st_mode)) ++entries;
            if (file >= 0) close(file);
        }
    }
    closedir(listing);
    for (const std::string& child : below) entries += ListFoldersBelow(child, openFiles);
    return entries;
}

// The other floors, of the mesh search: the mods tree listed once, and with each file opened once.
bool ListModFolders(const BaselineInput& input) {
    std::printf("%lld\n", ListFoldersBelow(input.modsRoot, false));
    return true;
}

bool ListModFoldersOpeningFiles(const BaselineInput& input) {
    std::printf("%lld\n", ListFoldersBelow(input.modsRoot, true));
    return true;
}

bool CountLines(const BaselineInput& input) {
    std::FILE* file = OpenRead(input.catalogueFolder + "/static.ini");
    if (!file) return false;
    static char block[1 << 16];
    long long lines = 0;
    bool afterCr = false;
    for (std::size_t got; (got = std::fread(block, 1, sizeof block, file)) > 0;) {
        for (std::size_t i = 0; i < got; ++i) {
            char c = block[i];
            if (c == '\n' && afterCr) {
                afterCr = false;
                continue;
            }
            afterCr = c == '\r';
            lines += c == '\r' || c == '\n' || c == '\0';
        }
    }
    std::fclose(file);
    std::printf("%lld\n", lines);
    return true;
}

std::vector<std::string> SectionNamesByBracket(std::FILE* file) {
    std::vector<std::string> names;
    std::string line;
    while (ReadCatalogueLine(file, line))
        if (Begins(line, "[bui")) names.push_back(std::string(SectionNameByBracket(line)));
    return names;
}

bool PairwiseDoubles(const BaselineInput& input) {
    std::FILE* file = OpenRead(input.catalogueFolder + "/static.ini");
    if (!file) return false;
    std::vector<std::string> names = SectionNamesByBracket(file);
    std::fclose(file);
    std::vector<std::string> found;
    for (std::size_t i = 0; i < names.size(); ++i)
        for (std::size_t k = i + 1; k < names.size(); ++k)
            if (names[k] == names[i]) {
                found.push_back("Double object (" + std::to_string(i) + ") => (" + std::to_string(k) + "): " + names[i]);
                break;
            }
    return WriteFindings(input, "Doubled_objects.txt", "Doubled objects in your static.ini:", found);
}

const char* const RegularLinePrefixes[] = {
    "/---",          "[_",     "Title",  "[buildings.House$", "Mesh",          "Body",
    "Panzer",        "equals", "AddHeightLive", "AddHeightDead", "AlignToLand", "[***] ",
    "Ignore",        "PAlign", "[buildings.Plate$", "(",         "[*",          "[air",
    "/",             "[buildings.Furniture$", "[buildings.Mountain$"};

bool PrefixTable(const BaselineInput& input) {
    std::FILE* file = OpenRead(input.catalogueFolder + "/static.ini");
    if (!file) return false;
    std::vector<std::string> found;
    int entry = 0;
    std::string line;
    while (ReadCatalogueLine(file, line)) {
        if (Begins(line, "[buil")) ++entry;
        bool regular = false;
        for (const char* prefix : RegularLinePrefixes)
            if (Begins(line, prefix)) {
                regular = true;
                break;
            }
        if (!regular && !line.empty())
            found.push_back("Irregular entry towards object " + std::to_string(entry) + ": " + line);
    }
    std::fclose(file);
    return WriteFindings(input, "Irregular_entrys.txt", "Irregular entrys in your static.ini:", found);
}

bool BareKeys(const BaselineInput& input) {
    Report report;
    if (!OpenReport(input, "Empty_references.txt", report)) return false;
    report.Line("Empty references in your static.ini");
    report.Line("");
    std::FILE* file = OpenRead(input.catalogueFolder + "/static.ini");
    if (!file) return false;
    int ordinal = -1;
    std::string section, line;
    bool any = false;
    while (ReadCatalogueLine(file, line)) {
        if (Begins(line, "[bui")) {
            ++ordinal;
            section = SectionNameByEnds(line);
        } else if (line == "Mesh" || line == "MeshLive" || line == "MeshDead") {
            if (line == "Mesh") report.Line("**************");
            report.Line("Object " + std::to_string(ordinal));
            report.Line(section);
            report.Line("Empty reference: " + line);
            any = true;
        }
    }
    std::fclose(file);
    if (!any) std::fputs("No empty references found in your static.ini", report.file);
    std::fclose(report.file);
    return true;
}

//--- the mesh reference run: an index sized to the physical lines, 42 exclusion passes

struct PlainMeshEntry {
    std::string title, sectionName;
    int number = 0;
    std::string mesh, meshLive, meshDead;
    unsigned char meshFound = 0, meshLiveFound = 0, meshDeadFound = 0;
};

void SetMeshValue(const std::string& line, std::string& field) {
    std::size_t at = LowerCopy(line).find("3do");
    if (at == std::string::npos) return;
    field = line.substr(at);
    for (char& c : field)
        if (c == '/') c = '\\';
}

bool BuildMeshIndex(const BaselineInput& input, std::vector<PlainMeshEntry>& index, long long& last) {
    std::string path = input.catalogueFolder + "/static.ini", line;
    std::FILE* file = OpenRead(path);
    if (!file) return false;
    long long lines = 0;
    while (ReadPhysicalLine(file, line)) ++lines;
    std::fclose(file);
    index.assign(static_cast<std::size_t>(lines + 2), PlainMeshEntry());
    last = -1;
    file = OpenRead(path);
    if (!file) return false;
    while (ReadCatalogueLine(file, line) && line != "[***]") {
    }
    std::string title;
    ReadPhysicalLine(file, title);
    while (ReadCatalogueLine(file, line)) {
        if (line == "[***]") {
            ReadCatalogueLine(file, title);
        } else if (Begins(line, "[bui")) {
            ++last;
            PlainMeshEntry& entry = index[static_cast<std::size_t>(last)];
            entry.title = title;
            entry.sectionName = SectionNameByEnds(line);
            entry.number = static_cast<int>(last);
        } else if (last >= 0 && Begins(line, "Mesh ")) {
            SetMeshValue(line, index[static_cast<std::size_t>(last)].mesh);
        } else if (last >= 0 && Begins(line, "MeshLive")) {
            SetMeshValue(line, index[static_cast<std::size_t>(last)].meshLive);
        } else if (last >= 0 && Begins(line, "MeshDead")) {
            SetMeshValue(line, index[static_cast<std::size_t>(last)].meshDead);
        }
    }
    std::fclose(file);
    for (const std::string& standard : StandardTitles)
        for (long long i = 0; i <= last; ++i)
            if (index[static_cast<std::size_t>(i)].title == standard) index[static_cast<std::size_t>(i)].title = "";
    return true;
}

void WriteMeshReportHeader(Report& report, const char* third) {
    report.Line("Obects sorted within standard titles (example: 'Title Furniture') up to 4.09b are not checked");
    report.Line("Mod objects using sims/meshes of standard objects will cause wrong alert");
    report.Line(third);
    report.Line("");
}

bool SharedLiveDeadMeshes(const BaselineInput& input) {
    std::vector<PlainMeshEntry> index;
    long long last = -1;
    if (!BuildMeshIndex(input, index, last)) return false;
    Report report;
    if (!OpenReport(input, "Doubled_sims_or_meshes.txt", report)) return false;
    WriteMeshReportHeader(report, "Doubled used sims in your static.ini:");
    const std::string stars(38, '*');
    for (const char* line : {" ", stars.c_str(), "Using the same MeshLive/MeshDead", stars.c_str(), " "}) report.Line(line);
    bool any = false;
    for (long long i = 0; i <= last; ++i) {
        const PlainMeshEntry& entry = index[static_cast<std::size_t>(i)];
        if (entry.title.empty() || entry.meshLive.empty() || entry.meshDead.empty() || entry.meshLive != entry.meshDead)
            continue;
        any = true;
        report.Line("**************");
        report.Line("Object (" + std::to_string(entry.number) + ")");
        report.Line(entry.sectionName);
        report.Line("MeshLive: " + entry.meshLive);
        report.Line("MeshDead: " + entry.meshDead);
    }
    if (!any) report.Line("No doubled used Meshs found");
    std::fclose(report.file);
    return true;
}

bool IsFolder(const std::string& path) {
    struct stat info;
    return stat(path.c_str(), &info) == 0 && S_ISDIR(info.st_mode);
}

// Opens the file a mesh value names inside one mod folder; the value's "\" become "/".
bool MeshFileOpens(const std::string& modFolder, const std::string& value) {
    std::string path = modFolder + "/" + value;
    for (char& c : path)
        if (c == '\\') c = '/';
    std::FILE* file = OpenRead(path);
    if (!file) return false;
    std::fclose(file);
    return true;
}

bool OpenPerMeshPerFolder(const BaselineInput& input) {
    std::vector<PlainMeshEntry> index;
    long long last = -1;
    if (!BuildMeshIndex(input, index, last)) return false;
    DIR* mods = opendir(input.modsRoot.c_str());
    long long opens = 0;
    while (dirent* modEntry = mods ? readdir(mods) : nullptr) {
        std::string modFolder = input.modsRoot + "/" + modEntry->d_name;
        if (!IsFolder(modFolder)) continue;
        DIR* mod = opendir(modFolder.c_str());
        while (dirent* inner = mod ? readdir(mod) : nullptr) {
            if (LowerCopy(inner->d_name) != "3do" || !IsFolder(modFolder + "/" + inner->d_name)) continue;
            for (long long i = 0; i <= last; ++i) {
                PlainMeshEntry& entry = index[static_cast<std::size_t>(i)];
                if (entry.title.empty()) continue;
                const std::pair<std::string*, unsigned char*> fields[] = {{&entry.mesh, &entry.meshFound},
                                                                          {&entry.meshLive, &entry.meshLiveFound},
                                                                          {&entry.meshDead, &entry.meshDeadFound}};
                for (const auto& [value, found] : fields) {
                    if (value->empty()) continue;
                    ++opens;
                    if (MeshFileOpens(modFolder, *value)) *found = 1;
                }
            }
        }
        if (mod) closedir(mod);
    }
    if (mods) closedir(mods);
    Report report;
    if (!OpenReport(input, "Missing_3do.txt", report)) return false;
    WriteMeshReportHeader(report, "Wrong sim references in your static.ini:");
    bool any = false;
    for (long long i = 0; i <= last; ++i) {
        const PlainMeshEntry& entry = index[static_cast<std::size_t>(i)];
        if (entry.title.empty()) continue;
        std::string object = "Object (" + std::to_string(entry.number) + ")";
        if (!entry.mesh.empty() && !entry.meshFound) {
            for (const std::string& line : {std::string("**************"), object, entry.sectionName,
                                            "Not found: Mesh " + entry.mesh})
                report.Line(line);
            any = true;
        }
        bool liveMissing = !entry.meshLive.empty() && !entry.meshLiveFound;
        bool deadMissing = !entry.meshDead.empty() && !entry.meshDeadFound;
        // Both are named when both are missing: a report of missing files must not drop one.
        if (liveMissing || deadMissing) {
            for (const std::string& line : {std::string("**************"), object, entry.sectionName})
                report.Line(line);
            if (liveMissing) report.Line("Not found: MeshLive " + entry.meshLive);
            if (deadMissing) report.Line("Not found: MeshDead " + entry.meshDead);
            any = true;
        }
    }
    if (!any) report.Line("No wrong references found");
    std::fclose(report.file);
    std::printf("%lld opens\n", opens);
    return true;
}

//--- the map check: names read from the map's first bytes, each looked up by a walk from the start

std::string FilePrefix(const std::string& path, std::size_t size) {
    std::FILE* file = OpenRead(path);
    if (!file) return "";
    std::string bytes(size, '\0');
    bytes.resize(std::fread(bytes.data(), 1, bytes.size(), file));
    std::fclose(file);
    return bytes;
}

std::vector<std::string> PlacedNames(const std::string& mapFile) {
    std::string bytes = FilePrefix(mapFile, 140000), text;
    for (char byte : bytes) {
        unsigned char value = static_cast<unsigned char>(byte);
        if (value == 0) text += ' ';
        else if (value >= 33 && value <= 122) text += byte;
    }
    std::vector<std::string> placed;
    for (std::size_t at = text.find("build"); at != std::string::npos; at = text.find("build", at)) {
        std::size_t blank = text.find(' ', at);
        if (blank == std::string::npos) break;
        placed.push_back(text.substr(at, blank - at));
        at = blank;
    }
    return placed;
}

bool LinearNameWalk(const BaselineInput& input) {
    std::FILE* map = OpenRead(input.mapFile);
    if (!map) return false;
    std::fclose(map);
    std::vector<std::string> placed = PlacedNames(input.mapFile);
    std::FILE* file = OpenRead(input.catalogueFolder + "/static.ini");
    if (!file) return false;
    std::vector<std::string> names = SectionNamesByBracket(file);
    std::fclose(file);
    std::vector<std::string> missing;
    for (const std::string& name : placed) {
        bool found = false;
        for (std::size_t k = 0; k < names.size() && !found; ++k) found = names[k] == name;
        if (!found) missing.push_back(name);
    }
    return WriteFindings(input, "Missing_objects.txt", "Missing objects in your static.ini:", missing);
}

//--- every map: a walk of the maps folder sorted afterwards, the section names in one set

// The path parts below folder of each file named actors.static in any letter case.
void FindMapFiles(const std::string& folder, std::vector<std::string>& parts, std::vector<std::vector<std::string>>& found) {
    DIR* dir = opendir(folder.c_str());
    if (!dir) return;
    while (dirent* entry = readdir(dir)) {
        std::string name = entry->d_name, path = folder + "/" + name;
        struct stat info {};
        if (name == "." || name == ".." || stat(path.c_str(), &info) != 0) continue;
        parts.push_back(name);
        if (S_ISDIR(info.st_mode)) FindMapFiles(path, parts, found);
        else if (LowerCopy(name) == "actors.static") found.push_back(parts);
        parts.pop_back();
    }
    closedir(dir);
}

std::string Joined(const std::vector<std::string>& parts, char separator) {
    std::string path;
    for (const std::string& part : parts) path += (path.empty() ? "" : std::string(1, separator)) + part;
    return path;
}

bool NameSetPerMap(const BaselineInput& input) {
    std::string maps = input.modsRoot + "/mapmods/maps";
    std::vector<std::vector<std::string>> files;
    std::vector<std::string> parts;
    FindMapFiles(maps, parts, files);
    auto upper = [](std::vector<std::string> path) {
        for (std::string& part : path) std::transform(part.begin(), part.end(), part.begin(), ::toupper);
        return path;
    };
    std::sort(files.begin(), files.end(), [&](const auto& a, const auto& b) { return upper(a) < upper(b); });
    std::FILE* file = OpenRead(input.catalogueFolder + "/static.ini");
    if (!file) return false;
    std::vector<std::string> names = SectionNamesByBracket(file);
    std::fclose(file);
    std::set<std::string> defined(names.begin(), names.end());

    std::vector<std::string> lines, notMaps;
    for (const std::vector<std::string>& path : files) {
        std::string mapFile = maps + "/" + Joined(path, '/'), validation;
        for (char c : FilePrefix(mapFile, 50000))
            if (static_cast<unsigned char>(c) > 32) validation += c;
        if (validation.find("com.maddox.il2.objects") == std::string::npos) {
            notMaps.push_back("Not a map file: " + Joined(path, '\\'));
            continue;
        }
        std::vector<std::string> missing;
        for (const std::string& name : PlacedNames(mapFile))
            if (!defined.count(name) && std::find(missing.begin(), missing.end(), name) == missing.end())
                missing.push_back(name);
        if (missing.empty()) continue;
        lines.push_back("");
        lines.push_back("Map: " + Joined(path, '\\'));
        lines.insert(lines.end(), missing.begin(), missing.end());
    }
    if (lines.empty() && notMaps.empty()) return true;
    Report report;
    if (!OpenReport(input, "Missing_objects_all_maps.txt", report)) return false;
    report.Line("Missing objects of all maps in your static.ini:");
    if (!notMaps.empty()) lines.push_back("");
    lines.insert(lines.end(), notMaps.begin(), notMaps.end());
    for (const std::string& line : lines) report.Line(line);
    std::fclose(report.file);
    return true;
}

//--- rewriting: stream the catalogue through static.ini.tmp, once or twice

bool RewritePass(const std::string& folder, const std::function<void(const std::string&, std::FILE*)>& each) {
    std::string catalogue = folder + "/static.ini", temporary = folder + "/static.ini.tmp", line;
    std::FILE* in = OpenRead(catalogue);
    std::FILE* out = std::fopen(temporary.c_str(), "wb");
    if (!in || !out) return false;
    while (ReadPhysicalLine(in, line)) each(line, out);
    std::fclose(in);
    std::fclose(out);
    return std::remove(catalogue.c_str()) == 0 && std::rename(temporary.c_str(), catalogue.c_str()) == 0;
}

void WriteLine(std::FILE* out, const std::string& line) {
    std::fwrite(line.data(), 1, line.size(), out);
    std::fwrite("\r\n", 1, 2, out);
}

bool DenumberPass(const BaselineInput& input) {
    return RewritePass(input.catalogueFolder, [](const std::string& line, std::FILE* out) {
        if (line.find_first_of("()") == std::string::npos) WriteLine(out, line);
    });
}

bool RenumberPasses(const BaselineInput& input) {
    if (!DenumberPass(input)) return false;
    int n = 0;
    return RewritePass(input.catalogueFolder, [&n](const std::string& line, std::FILE* out) {
        if (Begins(line, "[bui")) {
            std::string number = std::to_string(n++);
            WriteLine(out, "(" + number + ")");
        }
        WriteLine(out, line);
    });
}

//--- the mission-builder lists

bool BuilderList(const BaselineInput& input, bool plus) {
    struct Entry {
        std::string groupTitle;
        int number;
        bool isPlate;
        std::string objectName;
    };
    std::FILE* file = OpenRead(input.catalogueFolder + "/static.ini");
    if (!file) return false;
    std::vector<Entry> entries;
    std::string title, line;
    int counter = -1;
    while (ReadCatalogueLine(file, line)) {
        std::string lower = LowerCopy(line);
        if (lower.find("$kust") != std::string::npos || lower.find("$suribachi") != std::string::npos) continue;
        if (line == "[***]") {
            if (!ReadPhysicalLine(file, title)) title.clear();
        } else if (Begins(line, "[bui")) {
            entries.push_back({title, ++counter, false, std::string(ObjectNameOf(line))});
            if (!plus && lower.find("plate") != std::string::npos) {
                entries.back().isPlate = true;
                --counter;
            }
        }
    }
    std::fclose(file);
    Report report;
    if (!OpenReport(input, plus ? "Static_list_FMBplus.txt" : "Static_list_FMB.txt", report)) return false;
    report.Line(plus ? "Object list for fmb+" : "Object list for fmb");
    report.Line("");
    const std::string rule = std::string("//").append(41, '=');
    std::string written;
    for (const Entry& entry : entries) {
        if (entry.isPlate) continue;
        if (entry.groupTitle != written) {
            for (const std::string& text : {rule, std::string("[***]"), entry.groupTitle, rule}) report.Line(text);
            written = entry.groupTitle;
        }
        std::string number = std::to_string(entry.number);
        report.Line("(" + number + ") " + entry.objectName);
    }
    std::fclose(report.file);
    return true;
}

}  // namespace

bool RunBaseline(const std::string& name, const BaselineInput& input) {
    const std::pair<const char*, std::function<bool(const BaselineInput&)>> baselines[] = {
        {"floor", CountLines},
        {"listing-floor", ListModFolders},
        {"open-floor", ListModFoldersOpeningFiles},
        {"pairwise", PairwiseDoubles},
        {"prefix-table", PrefixTable},
        {"bare-keys", BareKeys},
        {"mesh-index", SharedLiveDeadMeshes},
        {"open-per-mesh", OpenPerMeshPerFolder},
        {"linear-walk", LinearNameWalk},
        {"name-set-per-map", NameSetPerMap},
        {"two-passes", RenumberPasses},
        {"one-pass", DenumberPass},
        {"entry-list", [](const BaselineInput& in) { return BuilderList(in, false); }},
        {"entry-list-plus", [](const BaselineInput& in) { return BuilderList(in, true); }},
    };
    for (const auto& [baselineName, run] : baselines)
        if (name == baselineName) return run(input);
    return false;
}
