// What every fuzz target shares: a scratch folder that the headless platform sees as a disk, the
// input written there as static.ini, and the bench's straightforward baselines as the oracles.
#pragma once

#include "output/command_result.h"

#include <cstdint>
#include <string>

extern const std::string Scratch;  // as the program names it, ending in "\"; removed at exit

// A fresh start for one input: platform and application state reset, the desktop emptied, the bytes
// written as static.ini and the progress list on for an odd size. Gives the bytes.
std::string Fresh(const std::uint8_t* data, std::size_t size);
void WriteFile(const std::string& name, const std::string& bytes);  // names below Scratch, "/" between
std::string ReadFile(const std::string& name, bool* exists = nullptr);
// On static.ini, mods/ and map/actors.static of the scratch folder; reports go to baseline/.
void RunBaselineOnScratch(const char* baseline);
// The command's report on the desktop must be the baseline's, byte for byte, or like it not be
// written, unless unjudged() finds the input beyond the baseline; the result must be Findings
// exactly when the report holds mark. A null mark is for a list: written, and Done.
void RequireBaseline(CommandResult result, const char* report, const char* baseline, const char* mark = "",
                     bool (*unjudged)() = nullptr);
void Require(bool holds, const std::string& what);  // or stops the run; libFuzzer keeps the input
