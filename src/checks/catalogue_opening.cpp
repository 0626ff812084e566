#include "checks/catalogue_opening.h"

#include "shell/messages.h"

bool OpenCatalogueForCheck(const std::string& folder, CatalogueReader& reader) {
    if (OpenCatalogue(folder, reader)) return true;
    ShowMessage("static.ini failure", "Can't open static.ini");
    return false;
}
