// The objects that one map places but the catalogue does not define.
#pragma once

#include "catalogue/catalogue_reader.h"
#include "output/command_result.h"

#include <string>
#include <string_view>
#include <vector>

const int NotInCatalogue = -1;

// For each map object name, the ordinal of the catalogue's first section name equal to it byte for
// byte, or NotInCatalogue. Only the map's names are held, however large the catalogue.
std::vector<int> FirstSectionOrdinals(const std::vector<std::string>& mapNames, LineReader& catalogue);

// Checks the map of a selection "folder\*file" against static.ini in the catalogue folder and
// writes Missing_objects.txt. A catalogue that cannot be opened ends the run without a word.
CommandResult FindMissingMapObjects(const std::string& selection, const std::string& catalogueFolder);
