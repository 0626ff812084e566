// "Renumber static.ini" and "Denumber static.ini": the catalogue rewritten in place.
#pragma once

#include "output/command_result.h"

#include <string>
#include <string_view>

// A line that holds, between blanks, nothing but "(", decimal digits and ")".
bool IsNumberLine(std::string_view line);

enum class Numbering { Renumber, Denumber };
// The catalogue's new text: number lines left out and, when renumbering, a fresh one counting
// from 0 above every line that begins with "[bui". Every other line is kept byte for byte, ending
// in CR LF. Each line left out or kept goes to the progress list while it is on.
std::string RewrittenCatalogue(const std::string& catalogue, Numbering numbering);

// static.ini is replaced in one step by the finished static.ini.tmp, or stays as it was.
CommandResult RenumberCatalogue(const std::string& catalogueFolder, Numbering numbering);
