// ".. empty references": "Mesh", "MeshLive" and "MeshDead" lines that hold the key alone.
#pragma once

#include "shell/command_result.h"

#include <string>
#include <vector>

struct EmptyReference {
    int objectNumber = -1;    // -1 before the first building header
    std::string sectionName;  // end cut of that header; "" before the first
    std::string key;
};

// The key when the line is a mesh key alone, "" otherwise.
std::string EmptyReferenceKey(const std::string& line);
// The finding's lines as the progress list shows them: a ruler, the object, the section, the key.
std::vector<std::string> EmptyReferenceLines(const EmptyReference& reference);

// The report is written even when nothing is found; Findings when something was.
CommandResult FindEmptyReferences(const std::string& catalogueFolder);
