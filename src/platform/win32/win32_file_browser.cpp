// The file browser list: a report-view list view that shows one folder at a time. At the top level
// it holds the drives and the documents folder; inside a folder a parent entry, the sub-folders and
// then the files that match the pattern. Opening an entry (double click, Enter) moves into it;
// Backspace moves up. Every click, double click and change of selection is a control event.
#include "platform/win32/win32_internal.h"

#include <commctrl.h>
#include <shellapi.h>
#include <shlobj.h>

#include <algorithm>
#include <map>

namespace {

enum class EntryKind { Parent, Place, Folder, File };  // a place is a drive or the documents folder

struct BrowserEntry {
    std::string name;
    EntryKind kind = EntryKind::File;
    std::string target;  // the folder an opened entry leads to, ending in "\" ("" for the top level)
    std::string type, modified;
    int icon = 0;
};

struct FileBrowser {
    HWND list = nullptr;
    int id = 0;
    std::string folder;                 // ends in "\"; "" at the top level
    std::string pattern;                // for the files shown
    std::vector<BrowserEntry> entries;  // in the order of the rows
    bool filling = false;               // rows change while filling: no events then
};

std::map<HWND, FileBrowser> Browsers;  // by list view

// Together with a vertical scroll bar the columns fit the chooser's 304 pixels.
const int NameColumnWidth = 122, TypeColumnWidth = 60, ModifiedColumnWidth = 100;

std::string WithBackslash(std::string folder) {
    if (!folder.empty() && folder.back() != '\\') folder += '\\';
    return folder;
}

bool IsDriveRoot(const std::string& folder) { return folder.size() == 3 && folder[1] == ':'; }

// The folder above, or "" for the top level above a drive or a network share.
std::string ParentFolder(const std::string& folder) {
    if (folder.empty() || IsDriveRoot(folder)) return "";
    std::string trimmed = folder.substr(0, folder.size() - 1);
    std::size_t slash = trimmed.rfind('\\');
    if (slash == std::string::npos) return "";
    std::string parent = trimmed.substr(0, slash + 1);
    bool shareRoot = parent.rfind("\\\\", 0) == 0 && std::count(parent.begin(), parent.end(), '\\') < 4;
    return shareRoot ? "" : parent;
}

struct ShellLook {
    int icon = 0;
    std::string type;
};

// Icon and type name by attributes and extension alone, so no file is opened; kept per extension.
ShellLook LookOf(const std::string& name, bool isFolder) {
    static std::map<std::string, ShellLook> known;
    std::size_t dot = name.rfind('.');
    std::string key = isFolder ? "\\" : dot == std::string::npos ? "" : name.substr(dot);
    CharLowerA(key.data());
    auto it = known.find(key);
    if (it != known.end()) return it->second;
    SHFILEINFOA information = {};
    SHGetFileInfoA(isFolder ? "folder" : ("file" + key).c_str(),
                   isFolder ? FILE_ATTRIBUTE_DIRECTORY : FILE_ATTRIBUTE_NORMAL, &information,
                   sizeof information,
                   SHGFI_USEFILEATTRIBUTES | SHGFI_SYSICONINDEX | SHGFI_SMALLICON | SHGFI_TYPENAME);
    ShellLook look{information.iIcon, information.szTypeName};
    if (look.type.empty()) look.type = isFolder ? "Folder" : "File";
    known[key] = look;
    return look;
}

std::string DriveType(const std::string& root) {
    switch (GetDriveTypeA(root.c_str())) {
        case DRIVE_REMOVABLE:
            return "Removable disk";
        case DRIVE_REMOTE:
            return "Network drive";
        case DRIVE_CDROM:
            return "CD drive";
        case DRIVE_RAMDISK:
            return "RAM disk";
        default:
            return "Local disk";
    }
}

// Removable and network drives keep the folder icon: asking the shell would touch the drive.
int DriveIcon(const std::string& root) {
    if (GetDriveTypeA(root.c_str()) != DRIVE_FIXED) return LookOf(root, true).icon;
    SHFILEINFOA information = {};
    SHGetFileInfoA(root.c_str(), 0, &information, sizeof information, SHGFI_SYSICONINDEX | SHGFI_SMALLICON);
    return information.iIcon;
}

std::string ModifiedText(const FILETIME& written) {
    FILETIME local;
    SYSTEMTIME time;
    if (!FileTimeToLocalFileTime(&written, &local) || !FileTimeToSystemTime(&local, &time)) return "";
    char date[64] = "", clock[64] = "";
    GetDateFormatA(LOCALE_USER_DEFAULT, DATE_SHORTDATE, &time, nullptr, date, sizeof date);
    GetTimeFormatA(LOCALE_USER_DEFAULT, TIME_NOSECONDS, &time, nullptr, clock, sizeof clock);
    return std::string(date) + " " + clock;
}

std::vector<BrowserEntry> TopLevelEntries() {
    std::vector<BrowserEntry> entries;
    char drives[512] = "";
    DWORD length = GetLogicalDriveStringsA(sizeof drives, drives);
    for (const char* root = drives; length < sizeof drives && *root != '\0'; root += lstrlenA(root) + 1) {
        BrowserEntry drive;
        drive.name = root;
        drive.kind = EntryKind::Place;
        drive.target = root;
        drive.type = DriveType(root);
        drive.icon = DriveIcon(root);
        entries.push_back(drive);
    }
    std::string documents = ShellFolderPath(CSIDL_PERSONAL);
    if (!documents.empty()) {
        BrowserEntry place;
        place.name = "Documents";
        place.kind = EntryKind::Place;
        place.target = WithBackslash(documents);
        ShellLook look = LookOf(documents, true);
        place.type = look.type;
        place.icon = look.icon;
        entries.push_back(place);
    }
    return entries;
}

bool ByName(const BrowserEntry& a, const BrowserEntry& b) {
    return lstrcmpiA(a.name.c_str(), b.name.c_str()) < 0;
}

// Hidden entries stay out of sight, as in the shell; a folder that cannot be listed (a drive that is
// not ready) shows its parent entry alone.
void AddListedEntries(const std::string& pattern, bool folders, std::vector<BrowserEntry>& entries) {
    WIN32_FIND_DATAA found;
    HANDLE search = FindFirstFileA(pattern.c_str(), &found);
    if (search == INVALID_HANDLE_VALUE) return;
    std::string folder = pattern.substr(0, pattern.rfind('\\') + 1);
    std::size_t first = entries.size();
    do {
        std::string name = found.cFileName;
        bool isFolder = (found.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
        if (isFolder != folders || name == "." || name == ".." ||
            (found.dwFileAttributes & FILE_ATTRIBUTE_HIDDEN))
            continue;
        BrowserEntry entry;
        entry.name = name;
        entry.kind = isFolder ? EntryKind::Folder : EntryKind::File;
        if (isFolder) entry.target = folder + name + "\\";
        ShellLook look = LookOf(name, isFolder);
        entry.type = look.type;
        entry.icon = look.icon;
        entry.modified = ModifiedText(found.ftLastWriteTime);
        entries.push_back(entry);
    } while (FindNextFileA(search, &found));
    FindClose(search);
    std::sort(entries.begin() + static_cast<std::ptrdiff_t>(first), entries.end(), ByName);
}

std::vector<BrowserEntry> FolderEntries(const std::string& folder, const std::string& pattern) {
    std::vector<BrowserEntry> entries;
    BrowserEntry parent;
    parent.name = "..";
    parent.kind = EntryKind::Parent;
    parent.target = ParentFolder(folder);
    parent.type = "Parent";
    parent.icon = LookOf(folder, true).icon;
    entries.push_back(parent);
    AddListedEntries(folder + "*", true, entries);
    AddListedEntries(folder + pattern, false, entries);
    return entries;
}

void SetCell(HWND list, int row, int column, const std::string& text) {
    LVITEMA cell = {};
    cell.iSubItem = column;
    cell.pszText = const_cast<char*>(text.c_str());
    SendMessageA(list, LVM_SETITEMTEXTA, static_cast<WPARAM>(row), reinterpret_cast<LPARAM>(&cell));
}

void ShowFolder(FileBrowser& browser, const std::string& folder) {
    browser.filling = true;
    browser.folder = folder;
    browser.entries = folder.empty() ? TopLevelEntries() : FolderEntries(folder, browser.pattern);
    HWND list = browser.list;
    SendMessageA(list, WM_SETREDRAW, FALSE, 0);
    SendMessageA(list, LVM_DELETEALLITEMS, 0, 0);
    for (std::size_t i = 0; i < browser.entries.size(); ++i) {
        const BrowserEntry& entry = browser.entries[i];
        LVITEMA row = {};
        row.mask = LVIF_TEXT | LVIF_IMAGE;
        row.iItem = static_cast<int>(i);
        row.pszText = const_cast<char*>(entry.name.c_str());
        row.iImage = entry.icon;
        int index = static_cast<int>(SendMessageA(list, LVM_INSERTITEMA, 0, reinterpret_cast<LPARAM>(&row)));
        SetCell(list, index, 1, entry.type);
        SetCell(list, index, 2, entry.modified);
    }
    // The first row takes the keyboard focus without being selected, so the arrow keys start there.
    LVITEMA focus = {};
    focus.stateMask = LVIS_FOCUSED;
    focus.state = LVIS_FOCUSED;
    SendMessageA(list, LVM_SETITEMSTATE, 0, reinterpret_cast<LPARAM>(&focus));
    SendMessageA(list, LVM_ENSUREVISIBLE, 0, FALSE);
    SendMessageA(list, WM_SETREDRAW, TRUE, 0);
    InvalidateRect(list, nullptr, TRUE);
    browser.filling = false;
}

int SelectedRow(const FileBrowser& browser) {
    int row =
        static_cast<int>(SendMessageA(browser.list, LVM_GETNEXTITEM, static_cast<WPARAM>(-1), LVNI_SELECTED));
    return row >= 0 && static_cast<std::size_t>(row) < browser.entries.size() ? row : -1;
}

// Opens the entry of a row when it leads to a folder; files stay where they are.
void OpenRow(FileBrowser& browser, int row) {
    if (row < 0 || static_cast<std::size_t>(row) >= browser.entries.size()) return;
    const BrowserEntry& entry = browser.entries[static_cast<std::size_t>(row)];
    if (entry.kind != EntryKind::File) ShowFolder(browser, entry.target);
}

// Whether a notification is one the program hears of; opening entries happens here too.
bool TakeNotification(FileBrowser& browser, const NMHDR& header) {
    switch (header.code) {
        case LVN_ITEMCHANGED: {
            const auto& change = reinterpret_cast<const NMLISTVIEW&>(header);
            return (change.uChanged & LVIF_STATE) && ((change.uOldState ^ change.uNewState) & LVIS_SELECTED);
        }
        case NM_CLICK:
            return true;
        case NM_DBLCLK:
            OpenRow(browser, reinterpret_cast<const NMITEMACTIVATE&>(header).iItem);
            return true;
        case NM_RETURN:
            OpenRow(browser, SelectedRow(browser));
            return true;
        case LVN_KEYDOWN:
            if (reinterpret_cast<const NMLVKEYDOWN&>(header).wVKey != VK_BACK || browser.folder.empty())
                return false;
            ShowFolder(browser, ParentFolder(browser.folder));
            return true;
        default:
            return false;
    }
}

void AddColumn(HWND list, int index, const char* title, int width) {
    LVCOLUMNA column = {};
    column.mask = LVCF_TEXT | LVCF_WIDTH | LVCF_SUBITEM;
    column.pszText = const_cast<char*>(title);
    column.cx = width;
    column.iSubItem = index;
    SendMessageA(list, LVM_INSERTCOLUMNA, static_cast<WPARAM>(index), reinterpret_cast<LPARAM>(&column));
}

}  // namespace

Handle AddFileBrowser(Handle window, int left, int top, int width, int height, int id,
                      const std::string& pathWithPattern) {
    HWND list =
        AddChildWindow(window, WC_LISTVIEWA, "",
                       WS_TABSTOP | LVS_REPORT | LVS_SINGLESEL | LVS_SHOWSELALWAYS | LVS_SHAREIMAGELISTS,
                       WS_EX_CLIENTEDGE, left, top, width, height, id);
    if (list == nullptr) return 0;
    SendMessageA(list, LVM_SETEXTENDEDLISTVIEWSTYLE, 0, LVS_EX_FULLROWSELECT | LVS_EX_DOUBLEBUFFER);
    SHFILEINFOA information = {};
    auto images = reinterpret_cast<HIMAGELIST>(
        SHGetFileInfoA("file", FILE_ATTRIBUTE_NORMAL, &information, sizeof information,
                       SHGFI_USEFILEATTRIBUTES | SHGFI_SYSICONINDEX | SHGFI_SMALLICON));
    SendMessageA(list, LVM_SETIMAGELIST, LVSIL_SMALL, reinterpret_cast<LPARAM>(images));
    AddColumn(list, 0, "Name", NameColumnWidth);
    AddColumn(list, 1, "Type", TypeColumnWidth);
    AddColumn(list, 2, "Modified", ModifiedColumnWidth);

    FileBrowser& browser = Browsers[list];
    browser = FileBrowser();
    browser.list = list;
    browser.id = id;
    std::size_t slash = pathWithPattern.rfind('\\');
    browser.pattern = slash == std::string::npos ? pathWithPattern : pathWithPattern.substr(slash + 1);
    if (browser.pattern.empty()) browser.pattern = "*.*";
    ShowFolder(browser, slash == std::string::npos ? "" : pathWithPattern.substr(0, slash + 1));
    return ToHandle(list);
}

std::string BrowserCurrentFolder(Handle browser) {
    auto it = Browsers.find(ToWindow(browser));
    return it == Browsers.end() ? "" : it->second.folder;
}

bool BrowserSelectedEntry(Handle browser, std::string& name, bool& isFile) {
    auto it = Browsers.find(ToWindow(browser));
    if (it == Browsers.end()) return false;
    int row = SelectedRow(it->second);
    if (row < 0) return false;
    const BrowserEntry& entry = it->second.entries[static_cast<std::size_t>(row)];
    name = entry.name;
    isFile = entry.kind == EntryKind::File;
    return true;
}

void NotifyFileBrowser(HWND window, const NMHDR& header) {
    auto it = Browsers.find(header.hwndFrom);
    if (it == Browsers.end() || it->second.filling || !TakeNotification(it->second, header)) return;
    Event event;
    event.window = ToHandle(window);
    event.kind = EventKind::Control;
    event.id = it->second.id;
    event.control = ToHandle(header.hwndFrom);
    EnqueueEvent(event);
}

void ForgetFileBrowsersOf(HWND window) {
    std::erase_if(Browsers, [window](const auto& entry) { return GetParent(entry.first) == window; });
}
