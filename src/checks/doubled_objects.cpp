#include "checks/doubled_objects.h"

#include "catalogue/name_table.h"
#include "output/app_state.h"
#include "output/catalogue_loading.h"
#include "output/messages.h"
#include "output/progress_list.h"
#include "output/reports.h"

#include <vector>

namespace {

// The names of one window of headers, each with its next repetition once known.
struct Window {
    explicit Window(NameWindow limits) : held(limits), latest(NameTableFor(limits.names)) {}
    HeldNames held;
    std::vector<int> next;
    NameTable latest;         // each name's latest place in the window
    std::size_t waiting = 0;  // names whose latest place has no next yet
    long long following = 0;  // the index of the next header read
};

// A header after the window is the next of its name's latest place, when that has none yet.
void NoteLaterHeader(Window& window, std::string_view name) {
    int slot = NameSlot(window.latest, window.held.names, name);
    if (slot >= 0 && window.next[slot] < 0) {
        window.next[slot] = static_cast<int>(window.following);
        --window.waiting;
    }
    ++window.following;
}

// Fills the window from the reader, standing at the window's first header; true when the catalogue
// ended within it.
bool FillWindow(LineReader& reader, Window& window) {
    std::string_view line;
    while (NextCatalogueLine(reader, line)) {
        if (!IsBuildingHeader(line)) continue;
        std::string_view name = SectionNameByBracket(line);
        if (!HoldName(window.held, name)) {
            NoteLaterHeader(window, name);
            return false;
        }
        window.next.push_back(-1);
        int& slot = NameSlot(window.latest, window.held.names, window.held.names.back());
        if (slot >= 0) window.next[slot] = static_cast<int>(window.following);
        else ++window.waiting;
        slot = static_cast<int>(window.held.names.size()) - 1;
        ++window.following;
    }
    return true;
}

// Scans the headers after a full window for the repetitions of its latest names.
void FindLaterRepetitions(LineReader& reader, Window& window) {
    std::string_view line;
    while (window.waiting > 0 && NextCatalogueLine(reader, line))
        if (IsBuildingHeader(line)) NoteLaterHeader(window, SectionNameByBracket(line));
}

}  // namespace

long long PairDoubledNames(const CataloguePass& openPass, NameWindow limits,
                           const std::function<void(const NamedObject&)>& sink) {
    long long first = 0;
    for (;;) {
        LineReader reader;
        if (!openPass(reader)) return -1;
        SkipBuildingHeaders(reader, first);
        Window window(limits);
        window.following = first;
        bool ended = FillWindow(reader, window);
        if (!ended) FindLaterRepetitions(reader, window);
        if (reader.ReadFailed()) return -1;
        // Clicks made while a window was read are dropped, as during every check.
        DrainPendingEvents();
        const std::vector<std::string_view>& names = window.held.names;
        for (std::size_t i = 0; i < names.size(); ++i)
            sink({static_cast<int>(first + static_cast<long long>(i)), names[i], window.next[i]});
        first += static_cast<long long>(names.size());
        if (ended) return first;
    }
}

std::string DoubledObjectLine(const NamedObject& object) {
    std::string line =
        "Double object (" + std::to_string(object.index) + ") => (" + std::to_string(object.next) + "): ";
    return line.append(object.name);
}

CommandResult FindDoubledObjects(const std::string& catalogueFolder, int& findings) {
    findings = 0;
    LineReader first;
    if (!OpenCatalogue(catalogueFolder, first, CantOpenCatalogue)) return CommandResult::Failed;
    if (ProgressListOn) ClearProgressList();
    const std::string ruler(67, '*');
    FindingsWriter writer{{"Doubled_objects.txt", "Doubled objects in your static.ini:", "No doubled objects",
                           "No doubled objects found in your static.ini"}};
    auto show = [&](const NamedObject& object) {
        if (ProgressListOn) {
            DrainPendingEvents();
            AddProgressLine("Build (" + std::to_string(object.index) + ") " + std::string(object.name));
        }
        if (object.next < 0) return;
        std::string line = DoubledObjectLine(object);
        if (ProgressListOn) {
            DrainPendingEvents();
            AddProgressLine(ruler);
            AddProgressLine(line);
            AddProgressLine(ruler);
        }
        AddFinding(writer, line);
    };
    long long objects = PairDoubledNames(PassesOver(catalogueFolder, first), NameWindow(), show);
    if (objects < 0) {
        TellCatalogueFailure(FileRead::FailedPartway, {});
        return FinishFindings(writer, false);
    }
    if (ProgressListOn) {
        AddProgressLine("");
        AddProgressLine("Total number of objects: " + std::to_string(objects));
    }
    findings = writer.findings;
    return FinishFindings(writer, true);
}
