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
#include <deque>
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
    AddLines({" ", StepRuler, "Starting output", " "}, add);
    DrainOnePendingEvent();
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
            add(std::string(entry.meshDeadFound ? "Found: MeshDead " : "Not Found: MeshDead ").append(entry.meshDead));
            reported = reported || !entry.meshDeadFound;
        }
    }
    if (!reported) add("No missing Meshs found");
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
    if (!reported) add("No wrong references found");
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

// The entries are gathered where growing moves none of them, then moved once into an index of
// their own size: a vector grown by doubling would hold up to three times the entries at once.
MeshIndex BuildMeshIndex(LineReader& reader) {
    MeshIndex index;
    std::deque<MeshIndexEntry> entries;
    std::string_view line, title;
    std::string value;
    bool grouped = false;
    while (!grouped && NextCatalogueLine(reader, line)) grouped = line == GroupMarker;
    // Only the first group's title line keeps its blanks; every later one is trimmed.
    if (grouped && NextPhysicalLine(reader, line)) title = index.text.Keep(line);
    while (grouped && NextCatalogueLine(reader, line)) {
        // Markers and headers begin with "[", mesh keys with "M": most lines of a big catalogue
        // are passed over at their first byte.
        if (line.empty() || (line[0] != '[' && line[0] != 'M')) continue;
        if (line == GroupMarker) {
            title = NextCatalogueLine(reader, line) ? index.text.Keep(line) : std::string_view();
        } else if (IsBuildingHeader(line)) {
            MeshIndexEntry entry;
            entry.title = title;
            entry.sectionName = index.text.Keep(SectionNameByEnds(line));
            entry.number = static_cast<int>(entries.size());
            entries.push_back(entry);
        } else if (entries.empty()) {
            continue;  // keys before the first header belong to no entry
        } else {
            const MeshSlot* slot = StartsWith(line, "Mesh ")      ? &MeshSlots[0]
                                   : StartsWith(line, "MeshLive") ? &MeshSlots[1]
                                   : StartsWith(line, "MeshDead") ? &MeshSlots[2]
                                                                  : nullptr;
            if (slot && CutMeshValue(line, value)) entries.back().*slot->value = index.text.Keep(value);
        }
    }
    index.entries.reserve(entries.size());
    while (!entries.empty()) {
        index.entries.push_back(entries.front());
        entries.pop_front();
    }
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

bool ReportMissingMeshes(const std::vector<MeshIndexEntry>& index, MeshOutput output, const LineSink& add) {
    return output == MeshOutput::ProgressList ? ListMissingMeshes(index, add)
                                              : WriteMissingMeshes(index, add);
}

bool ReportSharedLiveDeadMeshes(const std::vector<MeshIndexEntry>& index, MeshOutput output,
                                const LineSink& add) {
    const bool list = output == MeshOutput::ProgressList;
    AddLines({" ", SharedRuler, "Using the same MeshLive/MeshDead", SharedRuler, " "}, add);
    bool reported = false;
    for (const MeshIndexEntry& entry : index) {
        if (!SharesLiveDeadMesh(entry)) continue;
        reported = true;
        add(EntryRuler);
        // The list joins the object line and the section name; the report keeps them apart.
        if (list) {
            add(ObjectLine(entry).append(entry.sectionName));
        } else {
            add(ObjectLine(entry));
            add(std::string(entry.sectionName));
        }
        add(std::string("MeshLive: ").append(entry.meshLive));
        add(std::string("MeshDead: ").append(entry.meshDead));
    }
    if (!reported) add("No doubled used Meshs found");
    return reported;
}

namespace {

struct MeshRun {
    Handle waitWindow = 0;
    Handle bar = 0;
};

MeshRun StartMeshRun() {
    MeshRun run;
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

// The run's index, read from the catalogue unless an earlier check of the run made it; false, with
// the Wait window closed and the user told, when the catalogue could not be read whole.
bool MakeMeshIndex(const MeshRun& run, const std::string& catalogueFolder, SharedMeshIndex& shared) {
    if (shared.made) {
        if (ProgressListOn)
            for (const std::string& line : shared.progressLines) AddProgressLine(line);
        return true;
    }
    LineReader catalogue;
    FileRead read = OpenLines(catalogueFolder, "static.ini", catalogue);
    if (read == FileRead::Whole) shared.index = BuildMeshIndex(catalogue);
    if (read == FileRead::Whole && catalogue.ReadFailed()) read = FileRead::FailedPartway;
    if (read != FileRead::Whole) {
        CloseTopWindow(run.waitWindow);
        TellCatalogueFailure(read, CantOpenCatalogue);
        return false;
    }
    ExcludeStandardTitles(shared.index.entries, [&shared](const std::string& line) {
        AddProgressLine(line);
        if (shared.forASecondCheck) shared.progressLines.push_back(line);
    });
    shared.made = true;
    return true;
}

CommandResult FinishMeshRun(const MeshRun& run, const std::string& modsRoot, MeshCheck check,
                            SharedMeshIndex& shared, int& findings) {
    const bool missingMode = check == MeshCheck::MissingMeshes;
    std::vector<MeshIndexEntry>& index = shared.index.entries;
    if (ProgressListOn) {
        DrainPendingEvents();
        AddLines({" ", StepRuler, "Searching folders & files", " "});
        DrainPendingEvents();
    }
    if (missingMode) {
        SearchModMeshFolders(index, modsRoot, run.bar);
        if (ProgressListOn) ReportMissingMeshes(index, MeshOutput::ProgressList, AddProgressLine);
    } else if (ProgressListOn) {
        ReportSharedLiveDeadMeshes(index, MeshOutput::ProgressList, AddProgressLine);
    }
    CloseTopWindow(run.waitWindow);

    ReportFile report;
    if (!CreateReport(missingMode ? "Missing_3do.txt" : "Doubled_sims_or_meshes.txt", report))
        return CommandResult::Failed;
    WriteReportLine(
        report,
        "Obects sorted within standard titles (example: 'Title Furniture') up to 4.09b are not checked");
    WriteReportLine(report, "Mod objects using sims/meshes of standard objects will cause wrong alert");
    WriteReportLine(report, missingMode ? "Wrong sim references in your static.ini:"
                                        : "Doubled used sims in your static.ini:");
    WriteReportLine(report, "");
    LineSink toReport = [&report](const std::string& line) { WriteReportLine(report, line); };
    bool reported = missingMode ? ReportMissingMeshes(index, MeshOutput::ReportBody, toReport)
                                : ReportSharedLiveDeadMeshes(index, MeshOutput::ReportBody, toReport);
    findings = CountMeshFindings(index, check);
    if (!FinishReport(report)) return CommandResult::Failed;
    return reported ? CommandResult::Findings : CommandResult::NothingFound;
}

}  // namespace

CommandResult CheckMeshReferences(const std::string& catalogueFolder, const std::string& modsRoot, MeshCheck check) {
    int findings = 0;
    SharedMeshIndex index;
    return CheckMeshReferencesSharing(catalogueFolder, modsRoot, check, index, findings);
}

CommandResult CheckMeshReferencesSharing(const std::string& catalogueFolder, const std::string& modsRoot,
                                         MeshCheck check, SharedMeshIndex& index, int& findings) {
    findings = 0;
    MeshRun run = StartMeshRun();
    if (!MakeMeshIndex(run, catalogueFolder, index)) return CommandResult::Failed;
    return FinishMeshRun(run, modsRoot, check, index, findings);
}
