// verrant-cli's command line.
#pragma once

#include <string>
#include <vector>

struct CliOptions {
    std::string command;
    std::string catalogue;  // host folder holding static.ini; "" when not given
    std::string tree;       // host folder anywhere in a modification tree; "" when not given
    std::string reportDir;  // host folder for reports; "" means the current folder
    std::string map;        // host path of a map file
    bool allMaps = false;   // missing-objects: every map of the tree
    bool progress = false;
    bool help = false;
    bool version = false;
};

// False with a reason when the words are off.
bool ParseCliOptions(const std::vector<std::string>& words, CliOptions& options, std::string& error);
