// What every fuzz target shares: a scratch folder (in memory where the system has one) and the
// headless platform set up afresh for each input.
#pragma once

#include "output/command_result.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

// Program path of the scratch folder, ending in "\"; made at the first call, removed at exit.
const std::string& ScratchFolder();
// Resets the headless platform and the application state; the desktop is the scratch folder's
// Desktop, which is emptied.
void ResetForInput();
void WriteScratchFile(const std::string& name, const std::string& bytes);
// The file's bytes; exists tells whether it was there.
std::string ReadScratchFile(const std::string& name, bool& exists);
// Whether the name is a file, not a folder, in the scratch folder; letter case counts.
bool IsScratchFile(const std::string& name);
std::string ReadDesktopFile(const std::string& name, bool& exists);
// Runs a bench baseline on the scratch catalogue and gives the report it wrote (or, for
// "@static.ini", the catalogue it rewrote, which must then be a copy in the folder "copy").
std::string BaselineOutput(const std::string& baseline, const std::string& report, bool& exists);
// Runs a catalogue check on the input as static.ini (the progress list on for an odd first byte)
// and requires its report to be the baseline's, byte for byte, or both to write none. For a check
// that writes its report only with findings, the result must say whether it did. Gives the result.
CommandResult RunCheckAgainstBaseline(const std::uint8_t* data, std::size_t size, CommandResult (*check)(const std::string& catalogueFolder),
                                      const std::string& report, const std::string& baseline,
                                      bool reportOnlyWithFindings);
// Stops the run with a message when a property fails; libFuzzer keeps the input.
void Require(bool holds, const char* what);
// The lines of a catalogue as the program's reader gives them, trimmed or not.
std::vector<std::string> CatalogueLinesOf(const std::string& bytes, bool trimmed);
std::string CrLfText(const std::vector<std::string>& lines);
