// Straightforward versions of each command, written the way the command's own description reads
// (pairwise walks, linear lookups, one open per mesh per folder), to measure the real commands
// against. Of the program's code they use only the name cuts and text helpers.
#pragma once

#include <string>

struct BaselineInput {
    std::string catalogueFolder;  // holds static.ini
    std::string modsRoot;         // the mods folder
    std::string mapFile;          // an actors.static
    std::string reportFolder;     // where a baseline writes its report
};

// Runs the named baseline; false for an unknown name or a file it cannot read.
bool RunBaseline(const std::string& name, const BaselineInput& input);
