// ".. irregular entrys": catalogue lines that begin with none of the known prefixes.
#pragma once

#include "output/command_result.h"

#include "catalogue/catalogue_reader.h"

#include <functional>
#include <string>
#include <string_view>

struct JudgedLine {
    int objectNumber = 0;     // "[buil" lines up to and including this one
    std::string_view prefix;  // the known prefix it begins with; "" for an irregular line
    std::string_view line;    // holds while the sink has it
};

// The first known prefix the line begins with, or "" when it begins with none.
std::string_view RegularLinePrefixOf(std::string_view line);
// Gives the non-empty catalogue lines to the sink in file order with their verdicts; the regular
// ones only when keepRegular is set.
void JudgeCatalogueLines(LineReader& catalogue, bool keepRegular,
                         const std::function<void(const JudgedLine&)>& sink);
std::string IrregularEntryLine(const JudgedLine& entry);

// The check on static.ini in the folder; findings is the number of irregular lines.
CommandResult CheckIrregularEntries(const std::string& catalogueFolder, int& findings);
