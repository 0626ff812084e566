// "Renumber static.ini" and "Denumber static.ini": the catalogue rewritten in place.
#pragma once

#include "output/command_result.h"

#include "catalogue/catalogue_reader.h"

#include <functional>
#include <string>
#include <string_view>

// A line that holds, between blanks, nothing but "(", decimal digits and ")".
bool IsNumberLine(std::string_view line);

// Not a UTF-16 or UTF-32 text, by the byte-order marks of UTF-16 (and of UTF-32 in the order of
// Windows) or by more NUL bytes in its first block than the stray one a text catalogue may hold, as
// UTF-32 has in every character: such a catalogue is not rewritten.
bool IsTextCatalogue(std::string_view bytes);

enum class Numbering { Renumber, Denumber };
// The catalogue's new text, given to the sink a piece at a time: number lines left out and, when
// renumbering, a fresh one counting from 0 above every line that begins with "[bui". Every other
// line is kept byte for byte, ending in CR LF. Each line left out or kept goes to the progress list
// while it is on.
void RewriteCatalogue(LineReader& catalogue, Numbering numbering,
                      const std::function<void(std::string_view)>& sink);

// static.ini is replaced in one step by the finished static.ini.tmp, or stays as it was. One run at
// a time: a second one says so and stops.
CommandResult RenumberCatalogue(const std::string& catalogueFolder, Numbering numbering);
