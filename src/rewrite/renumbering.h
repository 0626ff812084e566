// "Renumber static.ini" and "Denumber static.ini": the catalogue rewritten in place.
#pragma once

#include "shell/command_result.h"

#include <string>

// A line that holds, between blanks, nothing but "(", decimal digits and ")".
bool IsNumberLine(const std::string& line);

// Mode "renumber" puts a number line, counting from 0, above every line that begins with "[bui";
// mode "denumber" takes the number lines out. Every other line is kept byte for byte, ending in
// CR LF. static.ini is replaced in one step by the finished static.ini.tmp, or stays as it was.
CommandResult RenumberCatalogue(const std::string& catalogueFolder, const std::string& mode);
