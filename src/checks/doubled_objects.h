// ".. doubled objects": building headers whose section names occur more than once.
#pragma once

#include "shell/command_result.h"

#include <string>
#include <vector>

struct DoubledObject {
    int firstIndex = 0;
    int secondIndex = 0;
    std::string sectionName;
};

// Pairs each occurrence of a name with its next repetition, in ascending order of the first.
std::vector<DoubledObject> PairDoubledNames(const std::vector<std::string>& names);
std::string DoubledObjectLine(const DoubledObject& doubled);

CommandResult FindDoubledObjects();
