// Every map of a tree at once: each actors.static under the maps folder tested and checked as a
// picked map is, with one report for all of them.
#pragma once

#include "catalogue/name_table.h"
#include "output/command_result.h"

#include <string>
#include <vector>

struct AllMapsCount {
    int maps = 0;             // files that passed the map test
    int mapsWithMissing = 0;  // maps placing at least one name the catalogue lacks
    int namesMissing = 0;     // those names, each once per map
    int notMaps = 0;          // files named actors.static that failed the map test
};

// The files named actors.static (any letter case) at any depth below the maps folder, as paths
// relative to it with "\", in path order without regard to letter case. False when the maps folder
// cannot be listed.
bool FindMapFiles(const std::string& mapsFolder, std::vector<std::string>& mapFiles);

// "N maps checked, M with missing objects, K names missing, F not map files"
std::string AllMapsSummary(const AllMapsCount& count);

// Checks every map file below the maps folder against static.ini in the catalogue folder and writes
// Missing_objects_all_maps.txt. A maps folder that cannot be listed fails without a word: the
// caller knows where it looked.
// The catalogue's names are held a window at a time, the maps read again for every window.
CommandResult CheckAllMaps(const std::string& catalogueFolder, const std::string& mapsFolder,
                           AllMapsCount& count, NameWindow window = NameWindow());
