// The probe: a WH_GETMESSAGE hook procedure in a DLL that Wine loads into the program's thread.
// It answers the driver's requests from inside the program and swallows them.
#include "probe.h"

#include <windows.h>

#include <commctrl.h>

#include <string>

namespace {

std::string Number(long long value) { return std::to_string(value); }

void Answer(const std::string& text) {
    char path[MAX_PATH] = "";
    if (!GetEnvironmentVariableA(PROBE_FILE_VARIABLE, path, sizeof path)) return;
    // Written aside and renamed, so the driver never reads half an answer.
    std::string partial = std::string(path) + ".part";
    HANDLE file = CreateFileA(partial.c_str(), GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS,
                              FILE_ATTRIBUTE_NORMAL, nullptr);
    if (file == INVALID_HANDLE_VALUE) return;
    DWORD written = 0;
    WriteFile(file, text.data(), static_cast<DWORD>(text.size()), &written, nullptr);
    CloseHandle(file);
    MoveFileExA(partial.c_str(), path, MOVEFILE_REPLACE_EXISTING);
}

void DescribeMenu(HMENU menu, int depth, std::string& out) {
    int count = GetMenuItemCount(menu);
    for (int i = 0; i < count; ++i) {
        char text[256] = "";
        MENUITEMINFOA item = {};
        item.cbSize = sizeof item;
        item.fMask = MIIM_FTYPE | MIIM_ID | MIIM_STATE | MIIM_SUBMENU | MIIM_STRING;
        item.dwTypeData = text;
        item.cch = sizeof text;
        if (!GetMenuItemInfoA(menu, static_cast<UINT>(i), TRUE, &item)) continue;
        const char* kind = (item.fType & MFT_SEPARATOR) ? "separator" : item.hSubMenu ? "sub" : "item";
        const char* state = (item.fState & MFS_DISABLED)  ? "disabled"
                            : (item.fState & MFS_CHECKED) ? "checked"
                                                          : "enabled";
        out += Number(depth) + "\t" + kind + "\t" + Number(item.hSubMenu ? 0 : item.wID) + "\t" + state +
               "\t" + text + "\n";
        if (item.hSubMenu) DescribeMenu(item.hSubMenu, depth + 1, out);
    }
}

std::string MenuAnswer(HWND window) {
    HMENU bar = GetMenu(window);
    if (bar == nullptr) return "no menu\n";
    MENUBARINFO info = {};
    info.cbSize = sizeof info;
    GetMenuBarInfo(window, OBJID_MENU, 0, &info);
    std::string out = "bar\t" + Number(info.rcBar.bottom - info.rcBar.top) + "\n";
    DescribeMenu(bar, 0, out);
    return out;
}

HWND FirstListView(HWND window) { return FindWindowExA(window, nullptr, WC_LISTVIEWA, nullptr); }

std::string CellText(HWND list, int row, int column) {
    char text[512] = "";
    LVITEMA cell = {};
    cell.iSubItem = column;
    cell.pszText = text;
    cell.cchTextMax = sizeof text;
    SendMessageA(list, LVM_GETITEMTEXTA, static_cast<WPARAM>(row), reinterpret_cast<LPARAM>(&cell));
    return text;
}

std::string RowsAnswer(HWND window) {
    HWND list = FirstListView(window);
    if (list == nullptr) return "no list\n";
    std::string out = "columns";
    HWND header = reinterpret_cast<HWND>(SendMessageA(list, LVM_GETHEADER, 0, 0));
    int columns = static_cast<int>(SendMessageA(header, HDM_GETITEMCOUNT, 0, 0));
    for (int c = 0; c < columns; ++c) {
        char text[64] = "";
        LVCOLUMNA column = {};
        column.mask = LVCF_TEXT;
        column.pszText = text;
        column.cchTextMax = sizeof text;
        SendMessageA(list, LVM_GETCOLUMNA, static_cast<WPARAM>(c), reinterpret_cast<LPARAM>(&column));
        out += std::string("\t") + text;
    }
    out += "\n";
    int rows = static_cast<int>(SendMessageA(list, LVM_GETITEMCOUNT, 0, 0));
    for (int r = 0; r < rows; ++r) {
        bool selected = SendMessageA(list, LVM_GETITEMSTATE, static_cast<WPARAM>(r), LVIS_SELECTED) != 0;
        out += std::string(selected ? "*" : "-") + "\t" + CellText(list, r, 0) + "\t" + CellText(list, r, 1) +
               "\n";
    }
    return out;
}

std::string SelectAnswer(HWND window, int row) {
    HWND list = FirstListView(window);
    if (list == nullptr) return "no list\n";
    SetFocus(list);
    LVITEMA state = {};
    state.stateMask = LVIS_SELECTED | LVIS_FOCUSED;
    state.state = LVIS_SELECTED | LVIS_FOCUSED;
    SendMessageA(list, LVM_SETITEMSTATE, static_cast<WPARAM>(row), reinterpret_cast<LPARAM>(&state));
    SendMessageA(list, LVM_ENSUREVISIBLE, static_cast<WPARAM>(row), FALSE);
    return "selected\n";
}

std::string PointAnswer(HWND window, int row) {
    HWND list = FirstListView(window);
    if (list == nullptr) return "no list\n";
    RECT cell = {};
    cell.left = LVIR_LABEL;
    SendMessageA(list, LVM_GETITEMRECT, static_cast<WPARAM>(row), reinterpret_cast<LPARAM>(&cell));
    return Number((cell.left + cell.right) / 2) + "\t" + Number((cell.top + cell.bottom) / 2) + "\n";
}

BOOL CALLBACK DescribeCaption(HWND child, LPARAM data) {
    auto* out = reinterpret_cast<std::string*>(data);
    char text[256] = "";
    GetWindowTextA(child, text, sizeof text);
    auto font = reinterpret_cast<HFONT>(SendMessageA(child, WM_GETFONT, 0, 0));
    HDC dc = GetDC(child);
    HGDIOBJ old = SelectObject(dc, font ? static_cast<HGDIOBJ>(font) : GetStockObject(SYSTEM_FONT));
    SIZE size = {};
    GetTextExtentPoint32A(dc, text, lstrlenA(text), &size);
    char face[LF_FACESIZE] = "";
    GetTextFaceA(dc, sizeof face, face);
    SelectObject(dc, old);
    ReleaseDC(child, dc);
    RECT box;
    GetWindowRect(child, &box);
    *out += std::string(text) + "\t" + Number(size.cx) + "\t" + Number(box.right - box.left) + "\t" +
            (font ? face : "(system font)") + "\n";
    return TRUE;
}

std::string CaptionsAnswer(HWND window) {
    std::string out;
    EnumChildWindows(window, DescribeCaption, reinterpret_cast<LPARAM>(&out));
    return out;
}

std::string AnswerFor(HWND window, WPARAM request, LPARAM row) {
    switch (request) {
        case ProbeMenu:
            return MenuAnswer(window);
        case ProbeRows:
            return RowsAnswer(window);
        case ProbeSelectRow:
            return SelectAnswer(window, static_cast<int>(row));
        case ProbeRowPoint:
            return PointAnswer(window, static_cast<int>(row));
        case ProbeCaptions:
            return CaptionsAnswer(window);
        default:
            return "unknown request\n";
    }
}

}  // namespace

extern "C" __declspec(dllexport) LRESULT CALLBACK ProbeHook(int code, WPARAM wParam, LPARAM lParam) {
    static const UINT request = RegisterWindowMessageA(PROBE_MESSAGE_NAME);
    auto* message = reinterpret_cast<MSG*>(lParam);
    if (code == HC_ACTION && wParam == PM_REMOVE && message->message == request) {
        Answer(AnswerFor(message->hwnd, message->wParam, message->lParam));
        message->message = WM_NULL;
    }
    return CallNextHookEx(nullptr, code, wParam, lParam);
}
