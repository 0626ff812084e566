#include "shell/startup.h"

#include "location/catalogue_folder.h"
#include "location/derived_paths.h"
#include "location/settings.h"
#include "platform/platform.h"
#include "output/app_state.h"
#include "shell/event_loop.h"
#include "shell/main_window.h"
#include "output/messages.h"
#include "output/progress_list.h"

namespace {

std::string CurrentFolderWithBackslash() {
    std::string folder = CurrentFolder();
    if (folder.empty() || folder.back() != '\\') folder += '\\';
    return folder;
}

// No settings file: the first command would ask anyway, so ask now and keep the answer.
void AskForCatalogueFolderAtStart() {
    ShowMessage("Path to static.ini", "Select path to static.ini (..\\mods\\STD\\com\\..\\objects) first");
    std::string chosen = ChooseCatalogueFolder();
    if (chosen.empty()) return;
    if (SavePath(chosen, StartFolder)) {
        LoadSettings(StartFolder);
        return;
    }
    // The choice still serves this run when it could not be saved.
    CatalogueFolder = chosen;
    MapsPattern = DeriveMapsPattern(chosen);
}

void CloseEverything() {
    if (IsWindowOpen(ProgressWindow)) CloseProgressList();
    CloseTopWindow(MainWindow);
}

}  // namespace

int RunVerrant() {
    ClearAppState();
    InitPlatform();
    OpenMainWindow();
    StartFolder = CurrentFolderWithBackslash();
    if (LoadSettings(StartFolder)) AskForCatalogueFolderAtStart();
    RunMainEventLoop();
    CloseEverything();
    return 0;
}
