#include "location/catalogue_from_map.h"

#include "catalogue/text.h"
#include "location/catalogue_folder.h"
#include "output/app_state.h"
#include "output/messages.h"

std::string DeriveCatalogueFolderFromMap(const std::string& mapSelection) {
    std::size_t found = LowerCopy(mapSelection).find("mod");
    std::string prefix = found == std::string::npos ? "" : mapSelection.substr(0, found);
    return prefix + "mods\\std\\com\\maddox\\il2\\objects\\";
}

std::string LocateCatalogueFromMapFile(const std::string& mapSelection) {
    CatalogueFolder = DeriveCatalogueFolderFromMap(mapSelection);
    if (!FolderHoldsCatalogue(CatalogueFolder)) {
        ShowMessage("static.ini not found", "Select static.ini manuelly");
        CatalogueFolder = ChooseCatalogueFolder();
    }
    return CatalogueFolder;
}
