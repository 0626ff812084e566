#include "plain_mesh_search.h"

#include "catalogue/text.h"
#include "checks/mesh_folder_search.h"
#include "output/app_state.h"
#include "output/messages.h"
#include "output/progress_list.h"

void SearchModMeshFoldersPlainly(std::vector<MeshIndexEntry>& index, const std::string& modsRoot,
                                 Handle bar) {
    int visits = 0, position = 0;
    std::vector<FolderEntry> mods, inMod;
    if (!ListFolder(modsRoot + "*.*", mods)) return;
    for (const FolderEntry& mod : mods) {
        DrainPendingEvents();
        if (!mod.isFolder || !ListFolder(modsRoot + mod.name + "\\*.*", inMod)) continue;
        for (const FolderEntry& folder : inMod) {
            if (!folder.isFolder || LowerCopy(folder.name) != "3do") continue;
            DrainPendingEvents();
            if (ProgressListOn) AddProgressLine("Check: " + ShownModsRoot(modsRoot) + mod.name + "\\3do");
            for (MeshIndexEntry& entry : index) {
                ++visits;
                for (const MeshSlot& slot : MeshSlots) {
                    if (entry.title.empty() || (entry.*slot.value).empty()) continue;
                    Handle file = OpenForReading((modsRoot + mod.name + "\\").append(entry.*slot.value));
                    if (file == 0) continue;
                    entry.*slot.found = true;
                    CloseFile(file);
                }
                if (visits != 5000) continue;
                if (++position == 36) position = 1;
                SetProgressBarPosition(bar, position);
                visits = 1;
            }
        }
    }
}
