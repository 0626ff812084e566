// verrant-cli missing-objects: the map check without the window and without the folder chooser.
#pragma once

#include "cli/cli_options.h"

#include <string>

// The selection "folder\*file" of the map named by --map, once it is known to be a map file, with
// the catalogue folder known: --catalogue, or the one derived from the map's path. Every refusal
// gives one line on standard error and false.
bool PrepareMapCheck(const CliOptions& options, std::string& selection);
