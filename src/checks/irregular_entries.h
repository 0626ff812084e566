// ".. irregular entrys": catalogue lines that begin with none of the known prefixes.
#pragma once

#include "output/command_result.h"

#include <string>
#include <string_view>
#include <vector>

struct JudgedLine {
    int objectNumber = 0;     // "[buil" lines up to and including this one
    std::string_view prefix;  // the known prefix it begins with; "" for an irregular line
    std::string_view line;
};

// The first known prefix the line begins with, or "" when it begins with none.
std::string_view RegularLinePrefixOf(std::string_view line);
// The non-empty catalogue lines in file order with their verdicts; the regular ones only when
// keepRegular is set.
std::vector<JudgedLine> JudgeCatalogueLines(const std::string& catalogue, bool keepRegular);
std::string IrregularEntryLine(const JudgedLine& entry);

// The check on the catalogue's bytes; findings is the number of irregular lines.
CommandResult CheckIrregularEntriesInCatalogue(const std::string& catalogue, int& findings);
