// The main window "Verrant V.1.3": two buttons and the menu bar whose ids the event loop serves.
#pragma once

#include "commands/command_table.h"

// The toggle "List searching"; the menu and button ids of the commands are in the command table.
const int ProgressToggleId = 102;

// Opens and shows the main window with its buttons and menu bar; without a menu bar when none can be
// made. Sets MainWindow, OpenCatalogueButton and ProgressToggle.
void OpenMainWindow();
