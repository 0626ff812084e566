// Paths derived from the catalogue folder: the mods root and the maps pattern.
#pragma once

#include <string>

// The path up to and including the "m" of its first "mods" (any case), then "ods\".
std::string DeriveModsRoot(const std::string& path);
// The same cut, then "ods\mapmods\maps\*.*".
std::string DeriveMapsPattern(const std::string& path);
