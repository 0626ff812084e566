#include "maps/missing_objects_window.h"

#include "location/catalogue_from_map.h"
#include "maps/map_file.h"
#include "maps/missing_map_objects.h"
#include "output/app_state.h"
#include "output/messages.h"

namespace {

const int FileListId = 1;
const int CloseButtonId = 2;
const int OkButtonId = 3;
const std::size_t ShownPathLimit = 43;

// The label keeps to the band above the file list, so it never paints over the list.
const int LabelHeight = 20;

}  // namespace

std::string ShownMapPath(const std::string& path) {
    if (path.size() <= ShownPathLimit) return path;
    return "..." + path.substr(path.size() - (ShownPathLimit - 3));
}

std::string TrackMapFileSelection(Handle fileList, Handle statusLine) {
    std::string folder = BrowserCurrentFolder(fileList);
    std::string entry, fileName;
    bool isFile = false;
    if (BrowserSelectedEntry(fileList, entry, isFile) && isFile) fileName = entry;
    SetControlText(statusLine, ShownMapPath(folder + fileName));
    return folder + "*" + fileName;
}

bool ValidateMapFile(Handle statusLine, const std::string& selection) {
    std::string folder, fileName;
    SplitMapFileSelection(selection, folder, fileName);
    if (folder.empty() || fileName.empty()) {
        if (statusLine != 0) SetControlText(statusLine, "No file selected");
        return false;
    }
    if (IsMapFile(folder, fileName)) return true;
    ShowMessage("Wrong file selected", "This is not a file of type 'actor.static'");
    return false;
}

void ShowMissingObjectsWindow(const std::string& mapsPattern) {
    FrameStyle frame;
    frame.systemMenu = true;
    frame.sizingBorder = true;
    Handle window = OpenWindowOrEnd("Searching missing objects", 300, 320, 324, 365, frame);
    AddLabel(window, "Select mod maps file of type 'actors.static' to examine", 10, 10, 284, LabelHeight);
    Handle fileList =
        AddFileBrowser(window, 10, 30, 304, 250, FileListId, mapsPattern.empty() ? "*.*" : mapsPattern);
    Handle statusLine = AddTextBox(window, 10, 300, 304, 20);
    AddPushButton(window, "Close", 10, 330, 50, 25, CloseButtonId);
    AddPushButton(window, "OK", 289, 330, 25, 25, OkButtonId);

    std::string selection;
    for (;;) {
        // Events of the other windows have been delivered, so they repaint; no command of theirs runs.
        Event event = WaitForEvent();
        if (event.window != window) continue;
        if (event.kind == EventKind::CloseRequest) break;
        if (event.kind != EventKind::Control) continue;
        if (event.control == fileList) {
            selection = TrackMapFileSelection(fileList, statusLine);
        } else if (event.id == CloseButtonId) {
            break;
        } else if (event.id == OkButtonId && ValidateMapFile(statusLine, selection)) {
            // The folder found is kept as CatalogueFolder, so it serves the later commands as well.
            FindMissingMapObjects(selection, LocateCatalogueFromMapFile(selection));
        }
    }
    CloseTopWindow(window);
}
