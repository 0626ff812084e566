#include "location/derived_paths.h"

#include "catalogue/text.h"

namespace {

// The prefix keeps the path's own letter case; the literal completes it.
std::string CutAtFirstMods(const std::string& path) {
    std::size_t found = LowerCopy(path).find("mods");
    return found == std::string::npos ? "" : path.substr(0, found + 1);
}

}  // namespace

std::string DeriveModsRoot(const std::string& path) { return CutAtFirstMods(path) + "ods\\"; }

std::string DeriveMapsPattern(const std::string& path) { return CutAtFirstMods(path) + "ods\\mapmods\\maps\\*.*"; }
