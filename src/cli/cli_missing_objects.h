// verrant-cli missing-objects: the map check without the window and without the folder chooser.
#pragma once

#include "cli/cli_options.h"
#include "shell/command_result.h"

// Checks the map named by --map against --catalogue, or against the catalogue folder derived from
// the map's path. Every refusal gives one line on standard error and Failed.
CommandResult RunMissingObjectsCommand(const CliOptions& options);
