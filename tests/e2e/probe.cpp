// The probe: a WH_GETMESSAGE hook procedure in a DLL that Wine loads into the program's thread.
// It answers the driver's requests from inside the program and swallows them.
#include "probe.h"

#include <windows.h>

#include <commctrl.h>

#include <fstream>
#include <string>

namespace {

// Each item on a line of its own, indented by its depth: "ID TEXT", a sub-menu's TEXT, or "-".
void DescribeMenu(HMENU menu, const std::string& indent, std::string& out) {
    for (int i = 0; i < GetMenuItemCount(menu); ++i) {
        char text[256] = "";
        MENUITEMINFOA item = {.cbSize = sizeof item,
                              .fMask = MIIM_FTYPE | MIIM_ID | MIIM_SUBMENU | MIIM_STRING};
        item.dwTypeData = text;
        item.cch = sizeof text;
        GetMenuItemInfoA(menu, static_cast<UINT>(i), TRUE, &item);
        bool rule = item.fType & MFT_SEPARATOR;
        out += "\n" + indent + (rule ? "-" : item.hSubMenu ? "" : std::to_string(item.wID) + " ") + text;
        if (item.hSubMenu) DescribeMenu(item.hSubMenu, indent + "  ", out);
    }
}

std::string Place(RECT box, SIZE less) {
    return std::to_string(box.left) + "," + std::to_string(box.top) + " " +
           std::to_string(box.right - box.left - less.cx) + "x" +
           std::to_string(box.bottom - box.top - less.cy);
}

// The client size is what the frame leaves without the menu bar: the menu takes its height from it.
std::string Layout(HWND window) {
    RECT box, frame = {};
    GetWindowRect(window, &box);
    LONG style = GetWindowLongA(window, GWL_STYLE);
    AdjustWindowRectEx(&frame, style, FALSE, GetWindowLongA(window, GWL_EXSTYLE));
    std::string out = Place(box, {frame.right - frame.left, frame.bottom - frame.top});
    const LONG bits[] = {WS_CAPTION, WS_SYSMENU, WS_THICKFRAME, WS_MINIMIZEBOX, WS_MAXIMIZEBOX};
    const char* traits[] = {" caption", " sysmenu", " sizing", " minbox", " maxbox"};
    for (int i = 0; i < 5; ++i)
        if ((style & bits[i]) == bits[i]) out += traits[i];
    if (GetClassLongA(window, GCL_STYLE) & CS_NOCLOSE) out += " noclose";
    for (HWND child = GetWindow(window, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT)) {
        char name[64] = "", text[256] = "", face[LF_FACESIZE] = "";
        GetClassNameA(child, name, sizeof name);
        GetWindowTextA(child, text, sizeof text);
        GetWindowRect(child, &box);
        MapWindowPoints(nullptr, window, reinterpret_cast<POINT*>(&box), 2);
        out.append("\n").append(name).append("\t").append(text).append("\t").append(Place(box, {}));
        if (GetWindowLongA(child, GWL_EXSTYLE) & WS_EX_CLIENTEDGE) out += " sunken";
        style = GetWindowLongA(child, GWL_STYLE) & (BS_PUSHLIKE | BS_TYPEMASK);
        if (lstrcmpA(name, "Button") == 0 && style == (BS_PUSHLIKE | BS_AUTOCHECKBOX)) out += " toggle";
        LVCOLUMNA column = {.mask = LVCF_TEXT, .pszText = face, .cchTextMax = sizeof face};
        for (WPARAM c = 0; SendMessageA(child, LVM_GETCOLUMNA, c, reinterpret_cast<LPARAM>(&column)); ++c)
            out.append(c ? "," : " columns ").append(face);
        // A caption must fit within two pixels of border a side, in a font other than the bold system one.
        HDC dc = GetDC(child);  // drawing in the system font unless the control has a font of its own
        SelectObject(dc, reinterpret_cast<HFONT>(SendMessageA(child, WM_GETFONT, 0, 0)));
        SIZE size = {};
        GetTextExtentPoint32A(dc, text, lstrlenA(text), &size);
        GetTextFaceA(dc, sizeof face, face);
        ReleaseDC(child, dc);
        if (text[0] && lstrcmpA(face, "System") == 0) out += " SYSTEM-FONT";
        if (size.cx + 4 > box.right - box.left) out += " TOO-NARROW:" + std::to_string(size.cx);
    }
    DescribeMenu(GetMenu(window), "", out);  // none on a window without a menu
    return out + "\n";
}

// The rows of the window's list view, or the lines of its list box.
std::string Rows(HWND window) {
    HWND list = FindWindowExA(window, nullptr, WC_LISTVIEWA, nullptr);
    HWND box = FindWindowExA(window, nullptr, "ListBox", nullptr);
    std::string out;
    char text[4096] = "";
    for (int row = 0; row < ListView_GetItemCount(list); ++row) {
        ListView_GetItemText(list, row, 0, text, sizeof text);
        out.append(text).append("\n");
    }
    for (LRESULT line = 0; line < SendMessageA(box, LB_GETCOUNT, 0, 0); ++line)
        out.append(text, SendMessageA(box, LB_GETTEXT, line, reinterpret_cast<LPARAM>(text))).append("\n");
    return out;
}

void UseRow(HWND window, LPARAM row, WPARAM how) {
    HWND list = FindWindowExA(window, nullptr, WC_LISTVIEWA, nullptr);
    SetFocus(list);
    ListView_SetItemState(list, row, LVIS_SELECTED | LVIS_FOCUSED, LVIS_SELECTED | LVIS_FOCUSED);
    ListView_EnsureVisible(list, row, FALSE);
    RECT cell = {};
    ListView_GetItemRect(list, row, &cell, LVIR_LABEL);
    LPARAM middle = MAKELPARAM((cell.left + cell.right) / 2, (cell.top + cell.bottom) / 2);
    if (how == ProbeEnterRow) PostMessageA(list, WM_KEYDOWN, VK_RETURN, 0x001C0001);
    if (how == ProbeDoubleClickRow) PostMessageA(list, WM_LBUTTONDBLCLK, MK_LBUTTON, middle);
    if (how == ProbeDoubleClickRow) PostMessageA(list, WM_LBUTTONUP, 0, middle);
}

}  // namespace

extern "C" __declspec(dllexport) LRESULT CALLBACK ProbeHook(int code, WPARAM wParam, LPARAM lParam) {
    static const UINT request = RegisterWindowMessageA(PROBE_MESSAGE_NAME);
    auto* message = reinterpret_cast<MSG*>(lParam);
    if (code == HC_ACTION && wParam == PM_REMOVE && message->message == request) {
        if (message->wParam >= ProbeSelectRow) UseRow(message->hwnd, message->lParam, message->wParam);
        // Written aside and renamed, so the driver never reads half an answer.
        std::ofstream(PROBE_ANSWER_FILE ".part", std::ios::binary)
            << (message->wParam == ProbeLayout ? Layout(message->hwnd) : Rows(message->hwnd));
        MoveFileExA(PROBE_ANSWER_FILE ".part", PROBE_ANSWER_FILE, MOVEFILE_REPLACE_EXISTING);
        message->message = WM_NULL;
    }
    return CallNextHookEx(nullptr, code, wParam, lParam);
}
