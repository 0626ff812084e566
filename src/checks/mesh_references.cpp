#include "checks/mesh_references.h"

#include "catalogue/catalogue_reader.h"
#include "catalogue/text.h"
#include "checks/mesh_folder_search.h"
#include "output/catalogue_loading.h"
#include "platform/platform.h"
#include "output/app_state.h"
#include "output/messages.h"
#include "output/progress_list.h"
#include "output/reports.h"

#include <algorithm>
#include <string_view>
#include <unordered_map>

const MeshSlot MeshSlots[3] = {{&MeshIndexEntry::mesh, &MeshIndexEntry::meshFound},
                               {&MeshIndexEntry::meshLive, &MeshIndexEntry::meshLiveFound},
                               {&MeshIndexEntry::meshDead, &MeshIndexEntry::meshDeadFound}};

// Matched whole and case-sensitively; the small "winter" of the Kiev group is the game's own.
const std::vector<std::string> StandardTitles = {
    "Title House",
    "Title HouseWinter",
    "Title Railroads",
    "Title Sea",
    "Title Furniture",
    "Title GroundPlate",
    "Title WinterGroundPlate",
    "Title ConcretePlate",
    "Title BlankPlate",
    "Title PCPPlate",
    "Title Pac_GrPlate",
    "Title Pac_SandPlate",
    "Title Vehicles",
    "Title Trains",
    "Title Houses of Piter",
    "Title Winter Houses of Piter",
    "Title Petropavlovskaia",
    "Title Petropavlovskaia Winter",
    "Title Kronstadt Summer",
    "Title Kronstadt Winter",
    "Title FinlandHouse",
    "Title FinlandHouseWinter",
    "Title Racing",
    "Title DesertGroundPlate",
    "Title House Pacific",
    "Title DummyGuns",
    "Title Mountain",
    "Title Houses of Kiev",
    "Title Houses of Kiev winter",
    "Title Houses of Norway",
    "Title Houses of Burma",
    "Title Houses of 46",
    "Title Winter Houses of 46",
    "Title Castles of Slovakia",
    "Title Churches of Slovakia",
    "Title Houses of Slovakia",
    "Title Industry of Slovakia",
    "Title Ruins of Slovakia",
    "Title Try Duby AF",
    "Title Slovakia Obstacles",
    "Title Rumania",
    "Title Humans",
};

namespace {

const std::string GroupMarker = "[***]";
const std::string StepRuler = "//**************************";
const std::string EntryRuler(14, '*');
const std::string SharedRuler(38, '*');

bool IsSet(std::string_view mesh) { return !mesh.empty(); }
bool IsMissing(std::string_view mesh, bool found) { return IsSet(mesh) && !found; }

std::string ObjectLine(const MeshIndexEntry& entry) { return "Object (" + std::to_string(entry.number) + ")"; }

std::string FoundLine(const std::string& key, std::string_view mesh, bool found) {
    return ((found ? "Found: " : "Not found: ") + key + " ").append(mesh);
}

bool SharesLiveDeadMesh(const MeshIndexEntry& entry) {
    return !entry.title.empty() && IsSet(entry.meshLive) && entry.meshLive == entry.meshDead;
}

void AddLines(std::initializer_list<std::string> lines, const LineSink& add = AddProgressLine) {
    for (const std::string& line : lines) add(line);
}

void AddBlockStart(const MeshIndexEntry& entry, const LineSink& add) {
    add(EntryRuler);
    add(ObjectLine(entry));
    add(std::string(entry.sectionName));
}

// Every set mesh with its result.
bool ListMissingMeshes(const std::vector<MeshIndexEntry>& index, const LineSink& add) {
    bool reported = false;
    for (const MeshIndexEntry& entry : index) {
        if (entry.title.empty()) continue;
        if (IsSet(entry.mesh)) {
            AddBlockStart(entry, add);
            add(FoundLine("Mesh", entry.mesh, entry.meshFound));
            reported = reported || !entry.meshFound;
        }
        if (!IsSet(entry.meshLive) && !IsSet(entry.meshDead)) continue;
        AddBlockStart(entry, add);
        if (IsSet(entry.meshLive)) {
            add(FoundLine("MeshLive", entry.meshLive, entry.meshLiveFound));
            reported = reported || !entry.meshLiveFound;
        }
        if (IsSet(entry.meshDead)) {
            // The list has always written this one with a capital F.
            std::string found = entry.meshDeadFound ? "Found: MeshDead " : "Not Found: MeshDead ";
            add(found.append(entry.meshDead));
            reported = reported || !entry.meshDeadFound;
        }
    }
    return reported;
}

// Only the missing meshes; when MeshLive and MeshDead are both missing, both are named.
bool WriteMissingMeshes(const std::vector<MeshIndexEntry>& index, const LineSink& add) {
    bool reported = false;
    for (const MeshIndexEntry& entry : index) {
        if (entry.title.empty()) continue;
        if (IsMissing(entry.mesh, entry.meshFound)) {
            reported = true;
            AddBlockStart(entry, add);
            add(FoundLine("Mesh", entry.mesh, false));
        }
        bool liveMissing = IsMissing(entry.meshLive, entry.meshLiveFound);
        bool deadMissing = IsMissing(entry.meshDead, entry.meshDeadFound);
        if (!liveMissing && !deadMissing) continue;
        reported = true;
        AddBlockStart(entry, add);
        if (liveMissing) add(FoundLine("MeshLive", entry.meshLive, false));
        if (deadMissing) add(FoundLine("MeshDead", entry.meshDead, false));
    }
    return reported;
}

bool WriteSharedLiveDeadMeshes(const std::vector<MeshIndexEntry>& index, MeshOutput output,
                               const LineSink& add) {
    bool reported = false;
    for (const MeshIndexEntry& entry : index) {
        if (!SharesLiveDeadMesh(entry)) continue;
        reported = true;
        add(EntryRuler);
        // The list joins the object line and the section name; the report keeps them apart.
        if (output == MeshOutput::ProgressList) {
            add(ObjectLine(entry).append(entry.sectionName));
        } else {
            add(ObjectLine(entry));
            add(std::string(entry.sectionName));
        }
        add(std::string("MeshLive: ").append(entry.meshLive));
        add(std::string("MeshDead: ").append(entry.meshDead));
    }
    return reported;
}

}  // namespace

bool CutMeshValue(std::string_view line, std::string& value) {
    std::size_t start = LowerCopy(line).find("3do");
    if (start == std::string::npos) return false;
    value = std::string(line.substr(start));
    std::replace(value.begin(), value.end(), '/', '\\');
    return true;
}

void WalkMeshLines(LineReader& reader,
                   const std::function<bool(std::string_view title, std::string_view header)>& onHeader,
                   const std::function<void(const MeshSlot& slot, std::string_view line)>& onMeshLine) {
    std::string_view line;
    std::string title;
    bool grouped = false, headed = false;
    while (!grouped && NextCatalogueLine(reader, line)) grouped = line == GroupMarker;
    // Only the first group's title line keeps its blanks; every later one is trimmed.
    if (grouped && NextPhysicalLine(reader, line)) title = line;
    while (grouped && NextCatalogueLine(reader, line)) {
        // Markers and headers begin with "[", mesh keys with "M": most lines of a big catalogue
        // are passed over at their first byte.
        if (line.empty() || (line[0] != '[' && line[0] != 'M')) continue;
        if (line == GroupMarker) {
            title = NextCatalogueLine(reader, line) ? line : std::string_view();
        } else if (IsBuildingHeader(line)) {
            if (!onHeader(title, line)) return;
            headed = true;
        } else if (headed) {  // keys before the first header belong to no entry
            const MeshSlot* slot = StartsWith(line, "Mesh ")      ? &MeshSlots[0]
                                   : StartsWith(line, "MeshLive") ? &MeshSlots[1]
                                   : StartsWith(line, "MeshDead") ? &MeshSlots[2]
                                                                  : nullptr;
            if (slot) onMeshLine(*slot, line);
        }
    }
}

// A window's room is made at once, so that the index never grows by doubling.
MeshIndex BuildMeshIndex(LineReader& reader, std::size_t first, std::size_t limit) {
    MeshIndex index;
    if (limit != SIZE_MAX) index.entries.reserve(limit);
    std::size_t headers = 0;
    std::string keptTitle;
    std::string_view title;
    std::string value;
    bool inWindow = false;
    WalkMeshLines(
        reader,
        [&](std::string_view groupTitle, std::string_view header) {
            if (headers >= first && headers - first == limit) {
                index.whole = false;
                return false;
            }
            inWindow = headers++ >= first;
            if (!inWindow) return true;
            if (index.entries.empty() || groupTitle != keptTitle) {
                keptTitle = groupTitle;
                title = index.text.Keep(groupTitle);
            }
            MeshIndexEntry entry;
            entry.title = title;
            entry.sectionName = index.text.Keep(SectionNameByEnds(header));
            entry.number = static_cast<int>(headers - 1);
            index.entries.push_back(entry);
            return true;
        },
        [&](const MeshSlot& slot, std::string_view line) {
            if (inWindow && CutMeshValue(line, value))
                index.entries.back().*slot.value = index.text.Keep(value);
        });
    return index;
}

// One pass sorts the entries of standard groups by their title, in index order; the titles are then
// excluded one after the other as before, without a walk over the whole index for each of the 42.
void ExcludeStandardTitles(std::vector<MeshIndexEntry>& index, const LineSink& add) {
    if (ProgressListOn) AddLines({StepRuler, "Excluding Standard Titles", " "}, add);
    std::unordered_map<std::string_view, std::size_t> titlePlace;
    for (std::size_t t = 0; t < StandardTitles.size(); ++t) titlePlace.emplace(StandardTitles[t], t);
    std::vector<std::vector<MeshIndexEntry*>> byTitle(StandardTitles.size());
    for (MeshIndexEntry& entry : index)
        if (auto place = titlePlace.find(entry.title); place != titlePlace.end()) byTitle[place->second].push_back(&entry);
    for (std::size_t t = 0; t < StandardTitles.size(); ++t) {
        if (ProgressListOn) AddLines({StepRuler, "Excluding " + StandardTitles[t], " "}, add);
        DrainPendingEvents();
        for (MeshIndexEntry* entry : byTitle[t]) {
            if (ProgressListOn) add("Excluding " + std::string(entry->sectionName));
            entry->title = {};
        }
    }
}

void OpenMeshOutput(const MeshOutputRun& run) {
    if (run.check == MeshCheck::SharedLiveDeadMeshes) {
        AddLines({" ", SharedRuler, "Using the same MeshLive/MeshDead", SharedRuler, " "}, run.add);
    } else if (run.output == MeshOutput::ProgressList) {
        AddLines({" ", StepRuler, "Starting output", " "}, run.add);
        DrainOnePendingEvent();
    }
}

void AddMeshWindow(MeshOutputRun& run, const std::vector<MeshIndexEntry>& window) {
    bool reported = run.check == MeshCheck::SharedLiveDeadMeshes
                        ? WriteSharedLiveDeadMeshes(window, run.output, run.add)
                    : run.output == MeshOutput::ProgressList ? ListMissingMeshes(window, run.add)
                                                             : WriteMissingMeshes(window, run.add);
    run.reported = run.reported || reported;
}

void CloseMeshOutput(const MeshOutputRun& run) {
    if (run.reported) return;
    run.add(run.check == MeshCheck::SharedLiveDeadMeshes ? "No doubled used Meshs found"
            : run.output == MeshOutput::ProgressList     ? "No missing Meshs found"
                                                         : "No wrong references found");
}

namespace {

const std::string ReportHeading[] = {
    "Obects sorted within standard titles (example: 'Title Furniture') up to 4.09b are not checked",
    "Mod objects using sims/meshes of standard objects will cause wrong alert"};

struct MeshRun {
    std::size_t windowEntries = MeshWindowEntries;
    Handle waitWindow = 0;
    Handle bar = 0;
    VisitCounter visits;  // counted on over the windows, so the bar moves as for one
};

MeshRun StartMeshRun(std::size_t windowEntries) {
    MeshRun run;
    run.windowEntries = windowEntries;
    run.waitWindow = OpenWindowOrEnd("Wait", 400, 340, 180, 40, FrameStyle{});
    run.bar = AddProgressBar(run.waitWindow, 10, 10, 160, 20, 0, 35);
    if (ProgressListOn) {
        ClearProgressList();
        AddLines({StepRuler, "Building object index"});
    }
    return run;
}

int CountMeshFindings(const std::vector<MeshIndexEntry>& index, MeshCheck check) {
    int findings = 0;
    for (const MeshIndexEntry& entry : index) {
        if (check == MeshCheck::SharedLiveDeadMeshes) {
            findings += SharesLiveDeadMesh(entry);
        } else if (!entry.title.empty()) {
            for (const MeshSlot& slot : MeshSlots) findings += IsMissing(entry.*slot.value, entry.*slot.found);
        }
    }
    return findings;
}

// A window of the index read from static.ini; false when it could not be read whole.
bool ReadMeshWindow(const MeshRun& run, const std::string& catalogueFolder, std::size_t first, MeshIndex& window,
                    FileRead& read) {
    LineReader catalogue;
    read = OpenLines(catalogueFolder, "static.ini", catalogue);
    if (read != FileRead::Whole) return false;
    window = BuildMeshIndex(catalogue, first, run.windowEntries);
    if (catalogue.ReadFailed()) read = FileRead::FailedPartway;
    return read == FileRead::Whole;
}

// The exclusion steps of a catalogue larger than a window. One read keeps the names of as many
// standard entries as a window holds; a title whose names did not all fit is read again on its own.
// False when a read failed.
bool ListStandardTitlesByReading(const MeshRun& run, const std::string& catalogueFolder, const LineSink& add) {
    auto readHeaders = [&](const std::function<void(std::size_t title, std::string_view header)>& onHeader) {
        LineReader catalogue;
        if (OpenLines(catalogueFolder, "static.ini", catalogue) != FileRead::Whole) return false;
        WalkMeshLines(
            catalogue,
            [&](std::string_view title, std::string_view header) {
                auto standard = std::find(StandardTitles.begin(), StandardTitles.end(), title);
                if (standard != StandardTitles.end()) onHeader(standard - StandardTitles.begin(), header);
                return true;
            },
            [](const MeshSlot&, std::string_view) {});
        return !catalogue.ReadFailed();
    };
    TextStore kept;
    std::size_t keptNames = 0;
    std::vector<std::vector<std::string_view>> names(StandardTitles.size());
    std::vector<bool> allKept(StandardTitles.size(), true);
    bool whole = readHeaders([&](std::size_t title, std::string_view header) {
        if (keptNames++ < run.windowEntries) names[title].push_back(kept.Keep(SectionNameByEnds(header)));
        else allKept[title] = false;
    });
    AddLines({StepRuler, "Excluding Standard Titles", " "}, add);
    for (std::size_t t = 0; whole && t < StandardTitles.size(); ++t) {
        AddLines({StepRuler, "Excluding " + StandardTitles[t], " "}, add);
        DrainPendingEvents();
        if (allKept[t]) {
            for (std::string_view name : names[t]) add("Excluding " + std::string(name));
            continue;
        }
        whole = readHeaders([&](std::size_t title, std::string_view header) {
            if (title == t) add("Excluding " + std::string(SectionNameByEnds(header)));
        });
    }
    return whole;
}

// The run's first window, from the catalogue unless an earlier check of the run kept a whole index,
// with the exclusion steps; false, with the Wait window closed and the user told, when the catalogue
// could not be read whole.
bool MakeMeshIndex(const MeshRun& run, const std::string& catalogueFolder, SharedMeshIndex& shared) {
    if (shared.made && shared.index.whole) {
        if (ProgressListOn)
            for (const std::string& line : shared.progressLines) AddProgressLine(line);
        return true;
    }
    LineSink add = [&shared](const std::string& line) {
        AddProgressLine(line);
        if (shared.forASecondCheck) shared.progressLines.push_back(line);
    };
    FileRead read = FileRead::Whole;
    bool whole = ReadMeshWindow(run, catalogueFolder, 0, shared.index, read);
    bool listedByReading = whole && !shared.index.whole && ProgressListOn;
    if (listedByReading && !ListStandardTitlesByReading(run, catalogueFolder, add)) read = FileRead::FailedPartway;
    if (read != FileRead::Whole) {
        CloseTopWindow(run.waitWindow);
        TellCatalogueFailure(read, CantOpenCatalogue);
        return false;
    }
    if (shared.index.whole) {
        ExcludeStandardTitles(shared.index.entries, add);
        shared.made = true;
    } else {
        ExcludeStandardTitles(shared.index.entries, [](const std::string&) {});
    }
    return true;
}

CommandResult FinishMeshRun(MeshRun& run, const std::string& catalogueFolder, const std::string& modsRoot,
                            MeshCheck check, SharedMeshIndex& shared, int& findings) {
    const bool missingMode = check == MeshCheck::MissingMeshes;
    if (ProgressListOn) {
        DrainPendingEvents();
        AddLines({" ", StepRuler, "Searching folders & files", " "});
        DrainPendingEvents();
    }
    // The report is begun with the first window and told of, when it could not be made, at the end.
    ReportFile report;
    bool made = CreateReportSilently(missingMode ? "Missing_3do.txt" : "Doubled_sims_or_meshes.txt", report);
    for (const std::string& line : ReportHeading) WriteReportLine(report, line);
    WriteReportLine(report, missingMode ? "Wrong sim references in your static.ini:"
                                        : "Doubled used sims in your static.ini:");
    WriteReportLine(report, "");
    MeshOutputRun list{check, MeshOutput::ProgressList, AddProgressLine};
    LineSink toReport = [&report](const std::string& line) { WriteReportLine(report, line); };
    MeshOutputRun body{check, MeshOutput::ReportBody, toReport};
    OpenMeshOutput(body);

    MeshIndex later;  // a window after the first, when the catalogue has more than one
    MeshIndex* window = &shared.index;
    for (bool first = true;; first = false) {
        if (missingMode) SearchModMeshFolders(window->entries, modsRoot, run.bar, run.visits, first);
        if (ProgressListOn && first) OpenMeshOutput(list);
        if (ProgressListOn) AddMeshWindow(list, window->entries);
        AddMeshWindow(body, window->entries);
        findings += CountMeshFindings(window->entries, check);
        if (window->whole) break;
        std::size_t next = static_cast<std::size_t>(window->entries.back().number) + 1;
        *window = MeshIndex();  // gone before the next window comes in
        FileRead read = FileRead::Whole;
        if (!ReadMeshWindow(run, catalogueFolder, next, later, read)) {
            CloseTopWindow(run.waitWindow);
            DiscardReport(report);
            TellCatalogueFailure(FileRead::FailedPartway, {});
            return CommandResult::Failed;
        }
        ExcludeStandardTitles(later.entries, [](const std::string&) {});
        window = &later;
    }
    if (ProgressListOn) CloseMeshOutput(list);
    CloseTopWindow(run.waitWindow);
    CloseMeshOutput(body);
    if (!made) {
        TellReportFailure(report.fileName);
        return CommandResult::Failed;
    }
    if (!FinishReport(report)) return CommandResult::Failed;
    return body.reported ? CommandResult::Findings : CommandResult::NothingFound;
}

}  // namespace

CommandResult CheckMeshReferences(const std::string& catalogueFolder, const std::string& modsRoot, MeshCheck check,
                                  std::size_t windowEntries) {
    int findings = 0;
    SharedMeshIndex index;
    return CheckMeshReferencesSharing(catalogueFolder, modsRoot, check, index, findings, windowEntries);
}

CommandResult CheckMeshReferencesSharing(const std::string& catalogueFolder, const std::string& modsRoot,
                                         MeshCheck check, SharedMeshIndex& index, int& findings,
                                         std::size_t windowEntries) {
    findings = 0;
    MeshRun run = StartMeshRun(windowEntries);
    if (!MakeMeshIndex(run, catalogueFolder, index)) return CommandResult::Failed;
    return FinishMeshRun(run, catalogueFolder, modsRoot, check, index, findings);
}
