// ".. empty references": "Mesh", "MeshLive" and "MeshDead" lines that hold the key alone.
#pragma once

#include "output/command_result.h"

#include "catalogue/catalogue_reader.h"

#include <functional>
#include <string>
#include <string_view>
#include <vector>

struct EmptyReference {
    int objectNumber = -1;         // -1 before the first building header
    std::string_view sectionName;  // end cut of that header; "" before the first
    std::string_view key;
};

// Gives every mesh key that stands alone on its line to the sink, in file order; the views hold
// while the sink has them.
void FindEmptyReferenceLines(LineReader& catalogue, const std::function<void(const EmptyReference&)>& sink);
// The finding's lines as the progress list shows them: a ruler, the object, the section, the key.
std::vector<std::string> EmptyReferenceLines(const EmptyReference& reference);

// The check on static.ini in the folder; findings is the number of empty keys. The report is written
// even when nothing is found; Findings when something was.
CommandResult FindEmptyReferences(const std::string& catalogueFolder, int& findings);
