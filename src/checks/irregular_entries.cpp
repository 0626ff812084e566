#include "checks/irregular_entries.h"

#include "checks/catalogue_opening.h"
#include "catalogue/text.h"
#include "location/catalogue_folder.h"
#include "shell/app_state.h"
#include "shell/messages.h"
#include "shell/progress_list.h"
#include "shell/reports.h"

#include <vector>

namespace {

// Tried in this order, and the order shows: "Mesh" accepts "MeshLive" lines, "[***] " with its blank
// takes a group marker with text after it before "[*" takes the bare marker.
const std::string_view RegularLinePrefixes[] = {
    "/---",
    "[_",
    "Title",
    "[buildings.House$",
    "Mesh",
    "Body",
    "Panzer",
    "equals",
    "AddHeightLive",
    "AddHeightDead",
    "AlignToLand",
    "[***] ",
    "Ignore",
    "PAlign",
    "[buildings.Plate$",
    "(",
    "[*",
    "[air",
    "/",
    "[buildings.Furniture$",
    "[buildings.Mountain$",
};

const std::string Ruler41(41, '*');

}  // namespace

std::string_view RegularLinePrefixOf(const std::string& line) {
    for (std::string_view prefix : RegularLinePrefixes)
        if (line.compare(0, prefix.size(), prefix) == 0) return prefix;
    return {};
}

std::string IrregularEntryLine(const IrregularEntry& entry) {
    return "Irregular entry towards object " + std::to_string(entry.objectNumber) + ": " + entry.line;
}

CommandResult CheckIrregularEntries() {
    EnsureCatalogueFolder();
    if (CatalogueFolder.empty()) return CommandResult::NoFolder;
    CatalogueReader reader;
    if (!OpenCatalogueForCheck(CatalogueFolder, reader)) return CommandResult::Failed;
    if (ProgressListOn) ClearProgressList();

    std::vector<std::string> irregulars;  // their report lines
    int entryNumber = 0, regularCount = 0;
    std::string line;
    while (NextCatalogueLine(reader, line)) {
        // Five characters, one more than a building header needs: "[bui" alone opens no entry here.
        if (StartsWith(line, "[buil")) ++entryNumber;
        if (std::string_view prefix = RegularLinePrefixOf(line); !prefix.empty()) {
            ++regularCount;
            if (ProgressListOn) {
                DrainPendingEvents();
                AddProgressLine("Reg: " + std::string(prefix) + " => " + line);
            }
        } else if (!line.empty()) {
            irregulars.push_back(IrregularEntryLine({entryNumber, line}));
            if (ProgressListOn) {
                DrainPendingEvents();
                AddProgressLine(Ruler41);
                AddProgressLine("Irregular entry towards object (" + std::to_string(entryNumber) +
                                "): " + line);
                AddProgressLine(Ruler41);
            }
        }
    }
    if (ProgressListOn) {
        AddProgressLine(" ");
        AddProgressLine("Regular lines: " + std::to_string(regularCount));
        AddProgressLine("Irregular lines: " + std::to_string(irregulars.size()));
    }
    CloseCatalogue(reader);

    if (irregulars.empty()) {
        ShowMessage("No irregular objects", "No irregular objects found in your static.ini");
        return CommandResult::NothingFound;
    }
    return WriteFindingsReport("Irregular_entrys.txt", "Irregular entrys in your static.ini:", irregulars);
}
