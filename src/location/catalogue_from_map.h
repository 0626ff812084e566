// The catalogue folder found from the path of a map file inside the modification tree.
#pragma once

#include <string>

// The selection cut before its first "mod" (any case), then "mods\std\com\maddox\il2\objects\".
// A "mod" in a folder above the tree (D:\Modding\) cuts there, and the folder is then wrong.
std::string DeriveCatalogueFolderFromMap(const std::string& mapSelection);
// The derived folder when it holds static.ini; otherwise the user is told and chooses one, which
// may be "". The result is also kept as CatalogueFolder.
std::string LocateCatalogueFromMapFile(const std::string& mapSelection);
