// The one table of commands that both front ends run: the main window by menu item or button id,
// verrant-cli by name. A new command is one row in the table, one function that takes what it
// works on as parameters, and one golden case under tests/golden.
#pragma once

#include "output/command_result.h"

#include <functional>
#include <span>
#include <string>
#include <string_view>

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
// The main window's "Open static.ini" button, apart from the menu ids.
const int OpenCatalogueButtonId = 101;

// What a command works on, taken from the application state when it starts.
struct CommandInput {
    std::string catalogueFolder;  // holds static.ini, ends in "\"
    std::string modsRoot;         // the catalogue folder cut at its first "mods", ending in "\"
    std::string mapsPattern;      // where the missing objects window opens
    std::string mapsFolder;       // the same without its "*.*": where every map is looked for
    std::string mapSelection;     // "folder\*file" of the map to check; "" opens the window instead
    std::string startFolder;      // holds verrant.ini
    // verrant-cli's own lines on standard output, such as a command's summary; none in the desktop
    // program, whose commands speak through reports and message boxes only.
    std::function<void(const std::string&)> summary;
};

struct Command {
    int id = 0;                     // menu item or button of the main window; 0 for none
    const char* cliName = nullptr;  // nullptr: the desktop program only
    const char* summary = "";
    bool needsCatalogueFolder = false;
    bool takesMap = false;          // checks the map of CommandInput::mapSelection
    CommandResult (*run)(const CommandInput&) = nullptr;
    const char* cliOption = nullptr;  // the option that picks this row over the row of the same name
    bool takesMapsFolder = false;     // checks every map under CommandInput::mapsFolder
};

extern const std::span<const Command> Commands;

// nullptr when no command has that id (0 is none), or that name and option ("" for none).
const Command* CommandWithId(int id);
const Command* CommandNamed(std::string_view cliName, std::string_view cliOption = "");
// Asks for the catalogue folder first when the command needs one and none is known; then runs it.
CommandResult RunCommand(const Command& command, const std::string& mapSelection = "",
                         const std::function<void(const std::string&)>& summary = {});
