#include "cli/cli_missing_objects.h"

#include "catalogue/text.h"
#include "location/catalogue_folder.h"
#include "location/catalogue_from_map.h"
#include "maps/missing_objects_window.h"
#include "platform/headless/headless.h"
#include "output/app_state.h"

#include <cstdio>

bool PrepareMapCheck(const CliOptions& options, std::string& selection) {
    if (options.map.empty()) {
        std::fprintf(stderr, "verrant-cli: missing-objects needs --map FILE\n");
        return false;
    }
    // The file name stays as the user wrote it: only "static.ini" itself is refused unread.
    std::string path = HeadlessProgramPath(options.map);
    if (MakeFolderCurrent(path)) {
        std::fprintf(stderr, "verrant-cli: %s is a folder, not a map file\n", options.map.c_str());
        return false;
    }
    std::size_t slash = path.rfind('\\');
    std::string mapFolder = path.substr(0, slash + 1);
    selection = mapFolder + "*" + path.substr(slash + 1);
    if (!ValidateMapFile(0, selection)) return false;

    if (CatalogueFolder.empty()) {
        CatalogueFolder = DeriveCatalogueFolderFromMap(selection);
        // Without a "mod" in the path the folder is relative, as the desktop program takes it: to
        // the map's folder, which the validation left current.
        bool absolute = StartsWith(CatalogueFolder, "\\") || CatalogueFolder.compare(1, 1, ":") == 0;
        if (!absolute) CatalogueFolder = mapFolder + CatalogueFolder;
        if (!FolderHoldsCatalogue(CatalogueFolder)) {
            std::fprintf(stderr, "static.ini not found: %s\n", HeadlessHostPath(CatalogueFolder).c_str());
            return false;
        }
    } else if (!FolderHoldsCatalogue(CatalogueFolder)) {
        // The desktop program says nothing here, as its folder was found a moment before.
        std::fprintf(stderr, "static.ini failure: Can't open static.ini\n");
        return false;
    }
    return true;
}
