#include "location/catalogue_folder.h"

#include "platform/platform.h"
#include "output/app_state.h"
#include "output/messages.h"
#include "output/system_folders.h"

namespace {

const int ChooserBrowserId = 1;
const int ChooserOkId = 2;

std::string HomeDriveRoot() {
    std::string drive = GetEnvironmentValue("HOMEDRIVE");
    if (drive.empty()) drive = SystemDriveName();
    return drive + "\\";
}

// The text box shows where the user points; a selected file is shown, never kept.
std::string TrackChooserSelection(Handle browser, Handle pathBox) {
    std::string folder = BrowserCurrentFolder(browser);
    std::string shown = folder;
    std::string name;
    bool isFile = false;
    if (BrowserSelectedEntry(browser, name, isFile) && isFile) shown += name;
    SetControlText(pathBox, shown);
    return folder;
}

}  // namespace

bool EnsureCatalogueFolder() {
    if (CatalogueFolder.empty()) CatalogueFolder = ChooseCatalogueFolder();
    return !CatalogueFolder.empty();
}

bool FolderHoldsCatalogue(const std::string& folder) {
    if (!MakeFolderCurrent(folder)) return false;
    Handle file = OpenForReading("static.ini");
    if (file == 0) return false;
    CloseFile(file);
    return true;
}

std::string ChooseCatalogueFolder() {
    FrameStyle frame;
    frame.systemMenu = true;
    frame.sizingBorder = true;
    Handle window = OpenWindowOrEnd("Searching static.ini", 300, 320, 324, 365, frame);
    AddLabel(window, "Select folder with static.ini ", 10, 10, 284, 20);
    Handle browser = AddFileBrowser(window, 10, 30, 304, 250, ChooserBrowserId, "*.*");
    Handle pathBox = AddTextBox(window, 10, 300, 304, 20);
    AddPushButton(window, "OK", 289, 330, 25, 25, ChooserOkId);
    DrainPendingEvents();

    std::string candidate;
    for (;;) {
        Event event = WaitForEvent();
        if (event.window != window) continue;
        if (event.kind == EventKind::CloseRequest) {
            CloseTopWindow(window);
            return "";
        }
        if (event.kind != EventKind::Control) continue;
        if (event.control == browser) {
            candidate = TrackChooserSelection(browser, pathBox);
        } else if (event.id == ChooserOkId) {
            if (candidate.empty()) candidate = HomeDriveRoot();
            if (FolderHoldsCatalogue(candidate)) {
                CloseTopWindow(window);
                return candidate;
            }
            ShowMessage("Wrong folder selected", "There is no 'static.ini'");
            candidate.clear();
        }
    }
}
