// "Searching missing objects": the window in which the user picks a map file and checks it.
#pragma once

#include "platform/platform.h"

#include <string>

// Runs the window until "Close" or its close box. An empty maps pattern opens the file list on
// the drives.
void ShowMissingObjectsWindow(const std::string& mapsPattern);

// The path as the status line shows it: at most 43 characters, a longer one as "..." and its
// last 40.
std::string ShownMapPath(const std::string& path);
// For an event of the file list: shows the picked path and gives the selection "folder\*file",
// with an empty file name when no file is picked.
std::string TrackMapFileSelection(Handle fileList, Handle statusLine);
// Whether the selection names a map file. Without a file "No file selected" goes into the status
// line (none when statusLine is 0); a file that is no map file is refused with a message.
bool ValidateMapFile(Handle statusLine, const std::string& selection);
