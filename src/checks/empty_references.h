// ".. empty references": "Mesh", "MeshLive" and "MeshDead" lines that hold the key alone.
#pragma once

#include "output/command_result.h"

#include <string>
#include <string_view>
#include <vector>

struct EmptyReference {
    int objectNumber = -1;         // -1 before the first building header
    std::string_view sectionName;  // end cut of that header; "" before the first
    std::string_view key;
};

// Every mesh key that stands alone on its line, in file order.
std::vector<EmptyReference> FindEmptyReferenceLines(const std::string& catalogue);
// The finding's lines as the progress list shows them: a ruler, the object, the section, the key.
std::vector<std::string> EmptyReferenceLines(const EmptyReference& reference);

// The check on the catalogue's bytes; findings is the number of empty keys. The report is written
// even when nothing is found; Findings when something was.
CommandResult FindEmptyReferencesInCatalogue(const std::string& catalogue, int& findings);
