// How the catalogue folder becomes known during a run.
#pragma once

#include <string>

// When no catalogue folder is known, asks for one with the folder chooser. True when one is known
// afterwards; otherwise the command ends without a message.
bool EnsureCatalogueFolder();
// The folder chooser "Searching static.ini": a folder holding static.ini, ending in "\", or "" when
// the user closes it.
std::string ChooseCatalogueFolder();
// Whether "static.ini" opens for reading in the folder; the folder is left current.
bool FolderHoldsCatalogue(const std::string& folder);
