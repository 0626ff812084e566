// ".. doubled objects": building headers whose section names occur more than once.
#pragma once

#include "output/command_result.h"

#include <string>
#include <string_view>
#include <vector>

struct DoubledObject {
    int firstIndex = 0;
    int secondIndex = 0;
    std::string_view sectionName;
};

// Pairs each occurrence of a name with its next repetition, in ascending order of the first.
std::vector<DoubledObject> PairDoubledNames(const std::vector<std::string_view>& names);
std::string DoubledObjectLine(const DoubledObject& doubled);

// The check on the catalogue's bytes; findings is the number of pairs.
CommandResult FindDoubledObjectsInCatalogue(const std::string& catalogue, int& findings);
