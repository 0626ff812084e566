// check-all: every check of a tree in one run, for modpack builds.
#pragma once

#include "commands/command_table.h"

// Runs the five catalogue checks and the check of every map on one read of the catalogue, each
// writing its report as its own command does, and gives one summary line per check and a total.
// Failed when any check could not run (the others still run), else Findings when any found
// something.
CommandResult CheckAll(const CommandInput& input);
