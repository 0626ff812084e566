// The missing-meshes check: which mesh files of the index some mod's 3do folder under the mods root holds.
#pragma once

#include "checks/mesh_references.h"
#include "platform/platform.h"

#include <cstddef>
#include <string>
#include <vector>

// "...\" followed by the mods root from its first "mods" (any letter case) on.
std::string ShownModsRoot(const std::string& modsRoot);

// Every entry counts as visited once per searched 3do folder; the Wait window's bar shows the count.
struct VisitCounter {
    int visits = 0;
    int barPosition = 0;
};
// The bar moves after the first 5000 visits and then after every 4999 more, cycling through 1 to 35.
void CountVisits(VisitCounter& counter, std::size_t visits, Handle bar);

// Walks the mods root ("." and ".." included) and each folder in it with a 3do folder; a set mesh of
// an entry that has a title is found when the file opens in one of those folders. Shows a "Check: "
// line per searched folder, unless told not to (for a later window of a large catalogue), counts the
// visits on, and drains events as it goes.
void SearchModMeshFolders(std::vector<MeshIndexEntry>& index, const std::string& modsRoot, Handle bar,
                          VisitCounter& visits, bool showFolders);
// The same for an index that is the whole catalogue.
void SearchModMeshFolders(std::vector<MeshIndexEntry>& index, const std::string& modsRoot, Handle bar);
