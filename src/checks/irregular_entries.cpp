#include "checks/irregular_entries.h"

#include "catalogue/catalogue_reader.h"
#include "catalogue/text.h"
#include "output/app_state.h"
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

void ListJudgedLines(const std::vector<JudgedLine>& judged) {
    const std::string ruler(41, '*');
    std::size_t regular = 0;
    for (const JudgedLine& entry : judged) {
        DrainPendingEvents();
        if (!entry.prefix.empty()) {
            ++regular;
            AddProgressLine("Reg: " + std::string(entry.prefix) + " => " + std::string(entry.line));
            continue;
        }
        AddProgressLine(ruler);
        AddProgressLine("Irregular entry towards object (" + std::to_string(entry.objectNumber) +
                        "): " + std::string(entry.line));
        AddProgressLine(ruler);
    }
    AddProgressLine(" ");
    AddProgressLine("Regular lines: " + std::to_string(regular));
    AddProgressLine("Irregular lines: " + std::to_string(judged.size() - regular));
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

std::vector<JudgedLine> JudgeCatalogueLines(const std::string& catalogue, bool keepRegular) {
    std::vector<JudgedLine> judged;
    int objectNumber = 0;
    LineReader reader = LinesOf(catalogue);
    std::string_view line;
    while (NextCatalogueLine(reader, line)) {
        // Five characters, one more than a building header needs: "[bui" alone opens no entry here.
        if (StartsWith(line, "[buil")) ++objectNumber;
        std::string_view prefix = RegularLinePrefixOf(line);
        if (prefix.empty() ? !line.empty() : keepRegular) judged.push_back({objectNumber, prefix, line});
    }
    return judged;
}

std::string IrregularEntryLine(const JudgedLine& entry) {
    return "Irregular entry towards object " + std::to_string(entry.objectNumber) + ": " + std::string(entry.line);
}

CommandResult CheckIrregularEntriesInCatalogue(const std::string& catalogue, int& findings) {
    if (ProgressListOn) ClearProgressList();
    std::vector<JudgedLine> judged = JudgeCatalogueLines(catalogue, ProgressListOn);
    if (ProgressListOn) ListJudgedLines(judged);

    std::vector<std::string> lines;
    for (const JudgedLine& entry : judged)
        if (entry.prefix.empty()) lines.push_back(IrregularEntryLine(entry));
    findings = static_cast<int>(lines.size());
    return WriteFindingsReport({"Irregular_entrys.txt", "Irregular entrys in your static.ini:", "No irregular objects",
                                "No irregular objects found in your static.ini"},
                               lines);
}
