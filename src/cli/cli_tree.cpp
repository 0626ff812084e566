#include "cli/cli_tree.h"

#include "location/catalogue_from_tree.h"
#include "output/app_state.h"
#include "platform/headless/headless.h"

#include <cstdio>
#include <vector>

bool UseTreeCatalogue(const std::string& treeFolder) {
    std::string host = HeadlessHostPath(treeFolder);
    if (!MakeFolderCurrent(treeFolder)) {
        std::fprintf(stderr, "verrant-cli: tree folder %s does not exist\n", host.c_str());
        return false;
    }
    TreeFolders found;
    if (!FindCatalogueInTree(treeFolder, found)) {
        std::fprintf(
            stderr,
            "verrant-cli: static.ini not found: looked for mods/std/com/maddox/il2/objects/static.ini, "
            "in any letter case, in %s and in every folder above it\n",
            host.c_str());
        return false;
    }
    CatalogueFolder = found.catalogueFolder;
    MapsPattern = MapsFolderOf(found.modsFolder) + "*.*";
    std::fprintf(stderr, "verrant-cli: catalogue folder %s\n", HeadlessHostPath(CatalogueFolder).c_str());
    return true;
}

void TellMissingMapsFolder() {
    std::vector<FolderEntry> entries;
    if (ListFolder(MapsPattern, entries)) return;
    std::string mapsFolder = MapsPattern.substr(0, MapsPattern.rfind('\\') + 1);
    std::fprintf(stderr, "verrant-cli: no maps folder %s\n", HeadlessHostPath(mapsFolder).c_str());
}
