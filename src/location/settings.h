// The settings file verrant.ini in the start folder: one line, the catalogue folder, no line end.
#pragma once

#include <string>

// Reads the catalogue folder from the settings file and derives the maps pattern from it. True when
// there is no settings file to read; false when there is one, whatever the folder in it turned out to be.
bool LoadSettings(const std::string& startFolder);
// Writes the folder into the settings file and tells the user whether it worked; true when saved.
bool SavePath(const std::string& folder, const std::string& startFolder);
// Deletes the settings file in StartFolder and forgets the catalogue folder.
void ClearPath();
