// How a check opens the catalogue before it touches the progress list or a report.
#pragma once

#include "catalogue/catalogue_reader.h"

#include <string>

// Opens static.ini in the folder. When it cannot be opened the user is told ("static.ini failure")
// and false comes back; the check then ends without a progress line or a report.
bool OpenCatalogueForCheck(const std::string& folder, CatalogueReader& reader);
