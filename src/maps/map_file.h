// Map files (actors.static): the pick of one in the file list, the test that tells a map file,
// and the names of the objects it places, read from a bounded prefix of its bytes.
#pragma once

#include <string>
#include <string_view>
#include <vector>

// Splits a selection "folder\*file" at its first "*"; without one the whole text is the folder.
void SplitMapFileSelection(const std::string& selection, std::string& folder, std::string& fileName);

// The prefix bytes less every byte of value 0 to 32.
std::string ValidationTextOf(std::string_view bytes);
// NUL becomes a blank; 1 to 32 and 123 to 255 are dropped; "!" to "z" stay.
std::string MapTextOf(std::string_view bytes);
// Every piece of the map text from a "build" up to the next blank, in order, repeats kept.
std::vector<std::string> ExtractMapObjectNames(const std::string& mapText);

// Whether the file in the folder is a map file: never "static.ini" itself, and
// "com.maddox.il2.objects" within the validation text of its first 50,000 bytes.
bool IsMapFile(const std::string& folder, const std::string& fileName);
// The map text of the first 140,000 bytes of the file; "" when it cannot be read.
std::string ReadMapFileText(const std::string& folder, const std::string& fileName);
