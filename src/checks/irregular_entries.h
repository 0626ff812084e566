// ".. irregular entrys": catalogue lines that begin with none of the known prefixes.
#pragma once

#include "shell/command_result.h"

#include <string>
#include <string_view>

struct IrregularEntry {
    int objectNumber = 0;  // "[buil" lines up to and including this one
    std::string line;
};

// The first known prefix the line begins with, or "" when it begins with none.
std::string_view RegularLinePrefixOf(const std::string& line);
std::string IrregularEntryLine(const IrregularEntry& entry);

CommandResult CheckIrregularEntries();
