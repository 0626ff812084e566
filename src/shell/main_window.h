// The main window "Verrant V.1.3": two buttons and the menu bar whose ids the event loop serves.
#pragma once

enum MainMenuId {
    MenuClose = 1,
    MenuMissingObjects = 2,
    MenuDoubledObjects = 3,
    MenuIrregularEntries = 4,
    MenuWrongSimReferences = 5,
    MenuRenumber = 6,
    MenuDenumber = 7,
    MenuListForFmb = 8,
    MenuListForFmbPlus = 9,
    // 10 is not used
    MenuSavePath = 11,
    MenuClearPath = 12,
    MenuCredit = 13,
    MenuDoubledUsedSims = 14,
    MenuEmptyReferences = 15,
};

// Control ids of the two buttons, apart from the menu ids.
const int OpenCatalogueButtonId = 101;
const int ProgressToggleId = 102;

// Opens and shows the main window with its buttons and menu bar; without a menu bar when none can be
// made. Sets MainWindow, OpenCatalogueButton and ProgressToggle.
void OpenMainWindow();
