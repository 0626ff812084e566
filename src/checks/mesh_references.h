// The mesh reference run behind ".. wrong sim references" (mesh files that no mod's 3do folder
// holds) and ".. doubled used sims" (entries whose MeshLive and MeshDead are the same file). Both
// read the catalogue into one index of entries.
#pragma once

#include "catalogue/catalogue_reader.h"
#include "catalogue/text_store.h"
#include "output/command_result.h"
#include "output/progress_list.h"

#include <cstdint>
#include <functional>
#include <string>
#include <string_view>
#include <vector>

// Its text is kept by the index it belongs to.
struct MeshIndexEntry {
    std::string_view title;        // the title line of the entry's group; "" once excluded
    std::string_view sectionName;  // end cut of the building header
    int number = 0;                // ordinal among the headers after the first group marker
    std::string_view mesh;         // "Mesh " value from its first "3do", "/" turned into "\"; "" when unset
    std::string_view meshLive;
    std::string_view meshDead;
    bool meshFound = false;
    bool meshLiveFound = false;
    bool meshDeadFound = false;
};

// A mesh field of an entry with its found flag, so the three can be walked in their order.
struct MeshSlot {
    std::string_view MeshIndexEntry::*value;
    bool MeshIndexEntry::*found;
};
extern const MeshSlot MeshSlots[3];  // mesh, meshLive, meshDead

// The game's own title groups, in the order in which they are excluded.
extern const std::vector<std::string> StandardTitles;

// The value of a Mesh, MeshLive or MeshDead line: from its first "3do" in any letter case to the end,
// in the line's own case, with "/" turned into "\". False when the line holds no "3do".
bool CutMeshValue(std::string_view line, std::string& value);

using LineSink = std::function<void(const std::string&)>;

// Walks the catalogue after its first group marker: each building header with its group's title,
// and each mesh key line with the slot it sets in the entry of the header before it.
// onHeader ends the walk by returning false.
void WalkMeshLines(LineReader& catalogue,
                   const std::function<bool(std::string_view title, std::string_view header)>& onHeader,
                   const std::function<void(const MeshSlot& slot, std::string_view line)>& onMeshLine);

// The entries of building headers after the first group marker, from the first-th on and as many
// as the limit, with the text they view.
struct MeshIndex {
    std::vector<MeshIndexEntry> entries;
    TextStore text;
    bool whole = true;  // the catalogue has no entry after them
};
MeshIndex BuildMeshIndex(LineReader& catalogue, std::size_t first = 0, std::size_t limit = SIZE_MAX);
// Empties the title of every entry in a standard title group; later steps pass over such entries.
// While the progress list is on, the steps go to the sink.
void ExcludeStandardTitles(std::vector<MeshIndexEntry>& index, const LineSink& add = AddProgressLine);

enum class MeshCheck { MissingMeshes, SharedLiveDeadMeshes };
// Where a check's findings go: the progress list or the report's body. An output is given the
// index a window at a time: its opening lines before the first, its closing line after the last;
// reported tells whether any window gave findings.
enum class MeshOutput { ProgressList, ReportBody };
struct MeshOutputRun {
    MeshCheck check;
    MeshOutput output;
    LineSink add;
    bool reported = false;
};
void OpenMeshOutput(const MeshOutputRun& run);
void AddMeshWindow(MeshOutputRun& run, const std::vector<MeshIndexEntry>& window);
void CloseMeshOutput(const MeshOutputRun& run);

// How many entries a run holds at once, with their text and the search's plan: a catalogue with
// more is read again for every further window, and searched again.
const std::size_t MeshWindowEntries = 1 << 17;
// The whole run of one of the two checks; modsRoot ends in "\". Always writes and opens its report.
CommandResult CheckMeshReferences(const std::string& catalogueFolder, const std::string& modsRoot, MeshCheck check,
                                  std::size_t windowEntries = MeshWindowEntries);
// The index of one catalogue, made by the first check that needs it and kept for the other when it
// fits in one window: neither check reads what the other changes (the missing check sets found
// flags only).
struct SharedMeshIndex {
    bool made = false;
    MeshIndex index;
    bool forASecondCheck = false;            // keeps the lines below for it
    std::vector<std::string> progressLines;  // making it gave these; the second check shows them again
};
// The same with the index of an earlier check of the run; findings is the number of missing meshes,
// or of entries whose live and dead meshes are one file.
CommandResult CheckMeshReferencesSharing(const std::string& catalogueFolder, const std::string& modsRoot,
                                         MeshCheck check, SharedMeshIndex& index, int& findings,
                                         std::size_t windowEntries = MeshWindowEntries);
