// The catalogue folder of a modification tree given by any folder in it: the game folder, its mods
// folder, or a folder deeper inside.
#pragma once

#include <string>

struct TreeFolders {
    std::string catalogueFolder;  // mods\std\com\maddox\il2\objects\ as the disk spells it, ends in "\"
    std::string modsFolder;       // the tree's mods folder, ends in "\"
};

// Looks in the folder and then in each folder above it for mods\std\com\maddox\il2\objects\ holding
// static.ini, names in any letter case as Windows matches them. False when no folder up to the root
// has one.
bool FindCatalogueInTree(const std::string& folder, TreeFolders& found);
// The maps folder of a tree: mapmods\maps\ under its mods folder.
std::string MapsFolderOf(const std::string& modsFolder);
