#include "shell/event_loop.h"

#include "checks/doubled_objects.h"
#include "checks/empty_references.h"
#include "checks/irregular_entries.h"
#include "checks/mesh_references.h"
#include "location/catalogue_folder.h"
#include "location/derived_paths.h"
#include "location/settings.h"
#include "maps/missing_objects_window.h"
#include "platform/platform.h"
#include "rewrite/mission_builder_list.h"
#include "rewrite/renumbering.h"
#include "shell/app_state.h"
#include "shell/main_window.h"
#include "shell/progress_list.h"
#include "shell/reports.h"

namespace {

void RunMenuCommand(int id) {
    switch (id) {
        case MenuMissingObjects:
            ShowMissingObjectsWindow(MapsPattern);
            break;
        case MenuDoubledObjects:
            FindDoubledObjects();
            break;
        case MenuIrregularEntries:
            CheckIrregularEntries();
            break;
        case MenuEmptyReferences:
            if (EnsureCatalogueFolderKnown()) FindEmptyReferences(CatalogueFolder);
            break;
        case MenuSavePath:
            if (EnsureCatalogueFolderKnown()) SavePath(CatalogueFolder, StartFolder);
            break;
        case MenuClearPath:
            ClearPath();
            break;
        case MenuRenumber:
            if (EnsureCatalogueFolderKnown()) RenumberCatalogue(CatalogueFolder, "renumber");
            break;
        case MenuDenumber:
            if (EnsureCatalogueFolderKnown()) RenumberCatalogue(CatalogueFolder, "denumber");
            break;
        case MenuListForFmb:
            if (EnsureCatalogueFolderKnown()) CreateMissionBuilderList(CatalogueFolder, "fmb");
            break;
        case MenuListForFmbPlus:
            if (EnsureCatalogueFolderKnown()) CreateMissionBuilderList(CatalogueFolder, "fmb+");
            break;
        case MenuWrongSimReferences:
            if (EnsureCatalogueFolderKnown()) CheckMeshReferences(DeriveModsRoot(CatalogueFolder), "missing");
            break;
        case MenuDoubledUsedSims:
            if (EnsureCatalogueFolderKnown()) CheckMeshReferences(DeriveModsRoot(CatalogueFolder), "doubled");
            break;
        case MenuCredit:
            break;
        default:
            break;
    }
}

// The toggle's own state counts, taken at the click the loop sees: a click dropped while a command
// ran changed the toggle's look but nothing else.
void FollowProgressToggle() {
    ProgressListOn = IsToggleDown(ProgressToggle);
    bool open = IsWindowOpen(ProgressWindow);
    if (ProgressListOn && !open) OpenProgressList();
    if (!ProgressListOn && open) CloseProgressList();
}

void RunMainWindowEvent(Event& event) {
    ActivateTopWindow(MainWindow);
    if (event.kind == EventKind::MenuItem) {
        if (event.id == MenuClose)
            event.kind = EventKind::CloseRequest;
        else
            RunMenuCommand(event.id);
    } else if (event.kind == EventKind::Control) {
        if (event.id == ProgressToggleId) FollowProgressToggle();
        if (event.id == OpenCatalogueButtonId && EnsureCatalogueFolderKnown())
            OpenCatalogueInViewer(CatalogueFolder);
    }
}

}  // namespace

bool EnsureCatalogueFolderKnown() {
    EnsureCatalogueFolder();
    return !CatalogueFolder.empty();
}

void RunMainEventLoop() {
    for (;;) {
        Event event = WaitForEvent();
        if (event.window == MainWindow) RunMainWindowEvent(event);
        if (event.kind == EventKind::CloseRequest) return;
    }
}
