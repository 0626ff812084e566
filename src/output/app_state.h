// The application state: lives for the whole run, cleared at start.
#pragma once

#include "platform/platform.h"

#include <string>

extern std::string StartFolder;       // the current folder at start, ending in "\"; holds verrant.ini
extern std::string CatalogueFolder;   // holds static.ini, ends in "\"; "" while unknown
extern std::string MapsPattern;       // the maps folder followed by "*.*"; "" while unknown
extern bool ProgressListOn;           // the "List searching" toggle as the loop last took it

extern Handle MainWindow;             // "Verrant V.1.3"
extern Handle OpenCatalogueButton;    // "Open static.ini"
extern Handle ProgressToggle;         // "List searching"
extern Handle ProgressWindow;         // "List searching window"; 0 while closed
extern Handle ProgressList;           // the list in it

void ClearAppState();
