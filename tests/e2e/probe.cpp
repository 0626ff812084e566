// The probe: a WH_GETMESSAGE hook procedure in a DLL that Wine loads into the program's thread.
// It answers the driver's requests from inside the program and swallows them.
#include "probe.h"

#include <windows.h>

#include <commctrl.h>

#include <fstream>
#include <string>

namespace {

void DescribeMenu(HMENU menu, const std::string& indent, std::string& out) {
    for (int i = 0; i < GetMenuItemCount(menu); ++i) {
        char text[256] = "";
        MENUITEMINFOA item = {};
        item.cbSize = sizeof item;
        item.fMask = MIIM_FTYPE | MIIM_ID | MIIM_STATE | MIIM_SUBMENU | MIIM_STRING;
        item.dwTypeData = text;
        item.cch = sizeof text;
        GetMenuItemInfoA(menu, static_cast<UINT>(i), TRUE, &item);
        bool command = !item.hSubMenu && !(item.fType & MFT_SEPARATOR);
        out.append(indent).append(item.fType & MFT_SEPARATOR ? "-" : "");
        out.append(command ? std::to_string(item.wID) + " " : "").append(text).append("\n");
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
    AdjustWindowRectEx(&frame, static_cast<DWORD>(style), FALSE,
                       static_cast<DWORD>(GetWindowLongA(window, GWL_EXSTYLE)));
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
        LVCOLUMNA column = {};
        column.mask = LVCF_TEXT;
        column.pszText = face;
        column.cchTextMax = sizeof face;
        for (WPARAM c = 0; SendMessageA(child, LVM_GETCOLUMNA, c, reinterpret_cast<LPARAM>(&column)); ++c)
            out.append(c ? "," : " columns ").append(face);
        // A caption must fit between two pixels of border on each side, in a font other than the bold
        // system font.
        auto font = reinterpret_cast<HFONT>(SendMessageA(child, WM_GETFONT, 0, 0));
        HDC dc = GetDC(child);  // drawing in the system font unless a font is selected into it
        if (font) SelectObject(dc, font);
        SIZE size = {};
        GetTextExtentPoint32A(dc, text, lstrlenA(text), &size);
        GetTextFaceA(dc, sizeof face, face);
        ReleaseDC(child, dc);
        if (text[0] && lstrcmpA(face, "System") == 0) out += " SYSTEM-FONT";
        if (size.cx + 4 > box.right - box.left) out += " TOO-NARROW:" + std::to_string(size.cx);
    }
    return out + "\n";
}

std::string Rows(HWND list) {
    std::string out;
    char text[512] = "";
    LVITEMA cell = {};
    cell.pszText = text;
    cell.cchTextMax = sizeof text;
    for (WPARAM r = 0; r < static_cast<WPARAM>(SendMessageA(list, LVM_GETITEMCOUNT, 0, 0)); ++r) {
        SendMessageA(list, LVM_GETITEMTEXTA, r, reinterpret_cast<LPARAM>(&cell));
        out.append(text).append("\n");
    }
    return out;
}

void UseRow(HWND list, WPARAM row, WPARAM how) {
    SetFocus(list);
    LVITEMA state = {};
    state.stateMask = state.state = LVIS_SELECTED | LVIS_FOCUSED;
    SendMessageA(list, LVM_SETITEMSTATE, row, reinterpret_cast<LPARAM>(&state));
    SendMessageA(list, LVM_ENSUREVISIBLE, row, FALSE);
    RECT cell = {LVIR_LABEL, 0, 0, 0};
    SendMessageA(list, LVM_GETITEMRECT, row, reinterpret_cast<LPARAM>(&cell));
    LPARAM middle = MAKELPARAM((cell.left + cell.right) / 2, (cell.top + cell.bottom) / 2);
    if (how == ProbeEnterRow) PostMessageA(list, WM_KEYDOWN, VK_RETURN, 0x001C0001);
    if (how == ProbeDoubleClickRow) PostMessageA(list, WM_LBUTTONDBLCLK, MK_LBUTTON, middle);
    if (how == ProbeDoubleClickRow) PostMessageA(list, WM_LBUTTONUP, 0, middle);
}

std::string AnswerFor(HWND window, WPARAM request, WPARAM row) {
    HWND list = FindWindowExA(window, nullptr, WC_LISTVIEWA, nullptr);
    std::string out;
    if (request == ProbeMenu) DescribeMenu(GetMenu(window), "", out);
    if (request == ProbeLayout) out = Layout(window);
    if (request == ProbeRows) out = Rows(list);
    if (request >= ProbeSelectRow) UseRow(list, row, request);
    return out;
}

}  // namespace

extern "C" __declspec(dllexport) LRESULT CALLBACK ProbeHook(int code, WPARAM wParam, LPARAM lParam) {
    static const UINT request = RegisterWindowMessageA(PROBE_MESSAGE_NAME);
    auto* message = reinterpret_cast<MSG*>(lParam);
    if (code == HC_ACTION && wParam == PM_REMOVE && message->message == request) {
        char path[MAX_PATH] = "";
        GetEnvironmentVariableA(PROBE_FILE_VARIABLE, path, sizeof path);
        // Written aside and renamed, so the driver never reads half an answer.
        std::ofstream(std::string(path) + ".part", std::ios::binary)
            << AnswerFor(message->hwnd, message->wParam, static_cast<WPARAM>(message->lParam));
        MoveFileExA((std::string(path) + ".part").c_str(), path, MOVEFILE_REPLACE_EXISTING);
        message->message = WM_NULL;
    }
    return CallNextHookEx(nullptr, code, wParam, lParam);
}
