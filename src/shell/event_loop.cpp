#include "shell/event_loop.h"

#include "checks/doubled_objects.h"
#include "location/catalogue_folder.h"
#include "location/settings.h"
#include "platform/platform.h"
#include "shell/app_state.h"
#include "shell/main_window.h"
#include "shell/progress_list.h"
#include "shell/reports.h"

namespace {

void RunMenuCommand(int id) {
    switch (id) {
        case MenuDoubledObjects:
            FindDoubledObjects();
            break;
        case MenuSavePath:
            if (EnsureCatalogueFolderKnown()) SavePath(CatalogueFolder, StartFolder);
            break;
        case MenuClearPath:
            ClearPath();
            break;
        // Commands whose procedures come with their own units: one line each above when they land.
        case MenuMissingObjects:
        case MenuIrregularEntries:
        case MenuWrongSimReferences:
        case MenuDoubledUsedSims:
        case MenuEmptyReferences:
        case MenuRenumber:
        case MenuDenumber:
        case MenuListForFmb:
        case MenuListForFmbPlus:
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
