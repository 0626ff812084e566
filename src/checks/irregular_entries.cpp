#include "checks/irregular_entries.h"

#include "catalogue/catalogue_reader.h"
#include "catalogue/text.h"
#include "output/app_state.h"
#include "output/catalogue_loading.h"
#include "output/messages.h"
#include "output/progress_list.h"
#include "output/reports.h"

#include <array>

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

const std::string IrregularRuler(41, '*');

void ListJudgedLine(const JudgedLine& entry) {
    DrainPendingEvents();
    if (!entry.prefix.empty()) {
        AddProgressLine("Reg: " + std::string(entry.prefix) + " => " + std::string(entry.line));
        return;
    }
    AddProgressLine(IrregularRuler);
    AddProgressLine("Irregular entry towards object (" + std::to_string(entry.objectNumber) +
                    "): " + std::string(entry.line));
    AddProgressLine(IrregularRuler);
}

}  // namespace

// A line is tried only against the prefixes that begin with its first byte, in table order; no
// other prefix can match it, so the first that does is still the first of the whole table.
std::string_view RegularLinePrefixOf(std::string_view line) {
    static const std::array<std::vector<std::string_view>, 256> byFirstByte = [] {
        std::array<std::vector<std::string_view>, 256> table;
        for (std::string_view prefix : RegularLinePrefixes)
            table[static_cast<unsigned char>(prefix[0])].push_back(prefix);
        return table;
    }();
    if (line.empty()) return {};
    for (std::string_view prefix : byFirstByte[static_cast<unsigned char>(line[0])])
        if (StartsWith(line, prefix)) return prefix;
    return {};
}

void JudgeCatalogueLines(LineReader& catalogue, bool keepRegular,
                         const std::function<void(const JudgedLine&)>& sink) {
    int objectNumber = 0;
    std::string_view line;
    while (NextCatalogueLine(catalogue, line)) {
        // Five characters, one more than a building header needs: "[bui" alone opens no entry here.
        if (StartsWith(line, "[buil")) ++objectNumber;
        std::string_view prefix = RegularLinePrefixOf(line);
        if (prefix.empty() ? !line.empty() : keepRegular) sink({objectNumber, prefix, line});
    }
}

std::string IrregularEntryLine(const JudgedLine& entry) {
    return "Irregular entry towards object " + std::to_string(entry.objectNumber) + ": " + std::string(entry.line);
}

CommandResult CheckIrregularEntries(const std::string& catalogueFolder, int& findings) {
    findings = 0;
    LineReader catalogue;
    if (!OpenCatalogue(catalogueFolder, catalogue, CantOpenCatalogue)) return CommandResult::Failed;
    if (ProgressListOn) ClearProgressList();
    FindingsWriter writer{{"Irregular_entrys.txt", "Irregular entrys in your static.ini:", "No irregular objects",
                           "No irregular objects found in your static.ini"}};
    long long judged = 0;
    JudgeCatalogueLines(catalogue, ProgressListOn, [&](const JudgedLine& entry) {
        ++judged;
        if (ProgressListOn) ListJudgedLine(entry);
        if (entry.prefix.empty()) AddFinding(writer, IrregularEntryLine(entry));
    });
    bool whole = ReadToTheEnd(catalogue);
    if (ProgressListOn && whole) {
        AddProgressLine(" ");
        AddProgressLine("Regular lines: " + std::to_string(judged - writer.findings));
        AddProgressLine("Irregular lines: " + std::to_string(writer.findings));
    }
    findings = writer.findings;
    return FinishFindings(writer, whole);
}
