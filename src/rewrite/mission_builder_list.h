// ".. objects list for FMB" and ".. objects list for FMB+": the catalogue's building objects,
// grouped under their title lines and numbered, for the game's mission builder.
#pragma once

#include "output/command_result.h"

#include <string>

// Fmb writes Static_list_FMB.txt without the plate objects; FmbPlus writes
// Static_list_FMBplus.txt with them.
enum class BuilderList { Fmb, FmbPlus };
// The list goes to the report folder and opens in the viewer.
CommandResult CreateMissionBuilderList(const std::string& catalogueFolder, BuilderList variant);
