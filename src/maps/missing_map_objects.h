// The objects that one map places but the catalogue does not define.
#pragma once

#include "shell/command_result.h"

#include <string>
#include <vector>

const int NotInCatalogue = -1;

// For each map object name, the ordinal of the first section name equal to it byte for byte, or
// NotInCatalogue.
std::vector<int> FirstSectionOrdinals(const std::vector<std::string>& mapNames,
                                      const std::vector<std::string>& sectionNames);
// The section names of the catalogue's building headers by the bracket cut, in file order; false
// when static.ini cannot be opened in the folder.
bool ReadSectionNames(const std::string& catalogueFolder, std::vector<std::string>& sectionNames);

// Checks the map of a selection "folder\*file" against static.ini in the catalogue folder and
// writes Missing_objects.txt. A catalogue that cannot be opened ends the run without a word.
CommandResult FindMissingMapObjects(const std::string& selection, const std::string& catalogueFolder);
