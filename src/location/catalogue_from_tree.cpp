#include "location/catalogue_from_tree.h"

#include "catalogue/text.h"
#include "location/catalogue_folder.h"
#include "platform/platform.h"

#include <vector>

namespace {

// The folder's sub-folder whose lower-cased name is name, as listed (so in the disk's own letter
// case), ending in "\"; "" when there is none.
std::string SubFolderNamed(const std::string& folder, const std::string& name) {
    std::vector<FolderEntry> entries;
    if (!ListFolder(folder + "*.*", entries)) return "";
    for (const FolderEntry& entry : entries)
        if (entry.isFolder && LowerCopy(entry.name) == name) return folder + entry.name + "\\";
    return "";
}

// "D:\Sim\MODS\" gives "D:\Sim\", "D:\" and "\" give "".
std::string ParentFolder(const std::string& folder) {
    if (folder.size() < 2) return "";
    std::size_t slash = folder.find_last_of('\\', folder.size() - 2);
    return slash == std::string::npos ? "" : folder.substr(0, slash + 1);
}

}  // namespace

bool FindCatalogueInTree(const std::string& folder, TreeFolders& found) {
    for (std::string above = folder; !above.empty(); above = ParentFolder(above)) {
        std::string mods = SubFolderNamed(above, "mods");
        std::string catalogue = mods;
        for (const char* name : {"std", "com", "maddox", "il2", "objects"})
            if (!catalogue.empty()) catalogue = SubFolderNamed(catalogue, name);
        if (!catalogue.empty() && FolderHoldsCatalogue(catalogue)) {
            found = {catalogue, mods};
            return true;
        }
    }
    return false;
}

std::string MapsFolderOf(const std::string& modsFolder) { return modsFolder + "mapmods\\maps\\"; }
