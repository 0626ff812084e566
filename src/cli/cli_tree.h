// verrant-cli's --tree and the maps folder: where a run finds its catalogue and maps.
#pragma once

#include <string>

// Finds the catalogue of the tree named by --tree and makes it the catalogue folder, with the
// maps folder of the same tree; says on standard error where it found it, or where it looked.
bool UseTreeCatalogue(const std::string& treeFolder);
// Tells on standard error when the maps folder a command is about to check cannot be listed.
void TellMissingMapsFolder();
