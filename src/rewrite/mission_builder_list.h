// ".. objects list for FMB" and ".. objects list for FMB+": the catalogue's building objects,
// grouped under their title lines and numbered, for the game's mission builder.
#pragma once

#include "shell/command_result.h"

#include <string>

// Mode "fmb" writes Static_list_FMB.txt without the plate objects; mode "fmb+" writes
// Static_list_FMBplus.txt with them. The list goes to the report folder and opens in the viewer.
CommandResult CreateMissionBuilderList(const std::string& catalogueFolder, const std::string& mode);
