// Top-level windows, controls, menus, the application event queue and message boxes. Window
// procedures run no command: they only turn what the user did into events of the queue, which the
// program takes with WaitForEvent and TakePendingEvent.
#include "platform/win32/resources.h"
#include "platform/win32/win32_internal.h"

#include <commctrl.h>
#include <objbase.h>

#include <deque>
#include <vector>

namespace {

const char* const TopWindowClass = "VerrantWindow";
// Frames without a system menu: CS_NOCLOSE keeps Alt+F4 from closing what has no close box.
const char* const FixedWindowClass = "VerrantFixedWindow";

std::deque<Event> Queue;  // events waiting for the program, oldest first
bool ClassesRegistered = true;  // false when the system refused a window class: no window opens

bool IsButton(HWND control) {
    char name[16] = "";
    GetClassNameA(control, name, sizeof name);
    return lstrcmpiA(name, "Button") == 0;
}

void QueueCommand(HWND window, WPARAM wParam, LPARAM lParam) {
    Event event;
    event.window = ToHandle(window);
    event.id = LOWORD(wParam);
    HWND control = reinterpret_cast<HWND>(lParam);
    if (control == nullptr) {
        if (HIWORD(wParam) != 0) return;  // accelerators: the program has none
        event.kind = EventKind::MenuItem;
    } else {
        // Edits and statics notify about focus and text changes; only clicks are the user's doing.
        if (HIWORD(wParam) != BN_CLICKED || !IsButton(control)) return;
        event.kind = EventKind::Control;
        event.control = ToHandle(control);
    }
    EnqueueEvent(event);
}

LRESULT CALLBACK TopWindowProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
    switch (message) {
        case WM_COMMAND:
            QueueCommand(window, wParam, lParam);
            return 0;
        case WM_NOTIFY:
            NotifyFileBrowser(window, *reinterpret_cast<const NMHDR*>(lParam));
            return 0;
        case WM_CLOSE: {
            Event event;
            event.window = ToHandle(window);
            event.kind = EventKind::CloseRequest;
            EnqueueEvent(event);
            return 0;
        }
        default:
            return DefWindowProcA(window, message, wParam, lParam);
    }
}

void RegisterWindowClass(const char* name, UINT classStyle) {
    WNDCLASSEXA windowClass = {};
    windowClass.cbSize = sizeof windowClass;
    windowClass.style = classStyle;
    windowClass.lpfnWndProc = TopWindowProcedure;
    windowClass.hInstance = GetModuleHandleA(nullptr);
    windowClass.hIcon = LoadIconA(windowClass.hInstance, MAKEINTRESOURCEA(VERRANT_ICON_ID));
    if (windowClass.hIcon == nullptr) windowClass.hIcon = LoadIconA(nullptr, MAKEINTRESOURCEA(32512));
    windowClass.hCursor = LoadCursorA(nullptr, MAKEINTRESOURCEA(32512));  // the arrow
    windowClass.hbrBackground = reinterpret_cast<HBRUSH>(COLOR_BTNFACE + 1);
    windowClass.lpszClassName = name;
    if (RegisterClassExA(&windowClass) == 0 && GetLastError() != ERROR_CLASS_ALREADY_EXISTS)
        ClassesRegistered = false;
}

Event PopEvent() {
    Event event = Queue.front();
    Queue.pop_front();
    return event;
}

struct DisabledWindows {
    HWND spared = nullptr;
    std::vector<HWND> windows;
};

BOOL CALLBACK DisableOne(HWND window, LPARAM data) {
    auto* disabled = reinterpret_cast<DisabledWindows*>(data);
    if (window != disabled->spared && IsWindowVisible(window) && IsWindowEnabled(window)) {
        EnableWindow(window, FALSE);
        disabled->windows.push_back(window);
    }
    return TRUE;
}

}  // namespace

void EnqueueEvent(const Event& event) { Queue.push_back(event); }

HFONT GuiFont() {
    static HFONT font = [] {
        NONCLIENTMETRICSA metrics = {};
        metrics.cbSize = sizeof metrics;
        if (SystemParametersInfoA(SPI_GETNONCLIENTMETRICS, sizeof metrics, &metrics, 0))
            if (HFONT made = CreateFontIndirectA(&metrics.lfMessageFont)) return made;
        return static_cast<HFONT>(GetStockObject(DEFAULT_GUI_FONT));
    }();
    return font;
}

HWND AddChildWindow(Handle window, const char* windowClass, const std::string& text, DWORD style,
                    DWORD extendedStyle, int left, int top, int width, int height, int id) {
    HWND control =
        CreateWindowExA(extendedStyle, windowClass, text.c_str(), WS_CHILD | WS_VISIBLE | style, left, top,
                        width, height, ToWindow(window), reinterpret_cast<HMENU>(static_cast<INT_PTR>(id)),
                        GetModuleHandleA(nullptr), nullptr);
    if (control != nullptr) SendMessageA(control, WM_SETFONT, reinterpret_cast<WPARAM>(GuiFont()), TRUE);
    return control;
}

void InitPlatform() {
    static bool done = false;
    if (done) return;
    done = true;
    SetErrorMode(SEM_FAILCRITICALERRORS | SEM_NOOPENFILEERRORBOX);
    INITCOMMONCONTROLSEX controls = {};
    controls.dwSize = sizeof controls;
    controls.dwICC = ICC_STANDARD_CLASSES | ICC_WIN95_CLASSES | ICC_LISTVIEW_CLASSES | ICC_PROGRESS_CLASS;
    InitCommonControlsEx(&controls);
    CoInitializeEx(nullptr, COINIT_APARTMENTTHREADED);
    RegisterWindowClass(TopWindowClass, 0);
    RegisterWindowClass(FixedWindowClass, CS_NOCLOSE);
}

//--- windows

Handle OpenTopWindow(const std::string& title, int left, int top, int clientWidth, int clientHeight,
                     FrameStyle frame) {
    InitPlatform();
    if (!ClassesRegistered) return 0;
    DWORD style = WS_OVERLAPPED | WS_CAPTION | WS_CLIPCHILDREN;
    if (frame.systemMenu) style |= WS_SYSMENU;
    if (frame.sizingBorder) style |= WS_THICKFRAME;
    // The menu bar comes later and takes its height out of the client area.
    RECT outer = {0, 0, clientWidth, clientHeight};
    AdjustWindowRectEx(&outer, style, FALSE, 0);
    HWND window = CreateWindowExA(0, frame.systemMenu ? TopWindowClass : FixedWindowClass, title.c_str(),
                                  style, left, top, outer.right - outer.left, outer.bottom - outer.top,
                                  nullptr, nullptr, GetModuleHandleA(nullptr), nullptr);
    if (window == nullptr) return 0;
    ShowWindow(window, SW_SHOW);
    UpdateWindow(window);
    return ToHandle(window);
}

void CloseTopWindow(Handle window) {
    ForgetFileBrowsersOf(ToWindow(window));
    DestroyWindow(ToWindow(window));
    // Nothing can act on the events of a window that is gone; a stale close request would end the loop.
    std::erase_if(Queue, [window](const Event& event) { return event.window == window; });
}

bool IsWindowOpen(Handle window) { return window != 0 && IsWindow(ToWindow(window)); }

void ActivateTopWindow(Handle window) { SetForegroundWindow(ToWindow(window)); }

//--- buttons, label, text box

Handle AddPushButton(Handle window, const std::string& text, int left, int top, int width, int height,
                     int id) {
    return ToHandle(
        AddChildWindow(window, "BUTTON", text, WS_TABSTOP | BS_PUSHBUTTON, 0, left, top, width, height, id));
}

Handle AddToggleButton(Handle window, const std::string& text, int left, int top, int width, int height,
                       int id) {
    return ToHandle(AddChildWindow(window, "BUTTON", text, WS_TABSTOP | BS_AUTOCHECKBOX | BS_PUSHLIKE, 0,
                                   left, top, width, height, id));
}

bool IsToggleDown(Handle toggle) { return SendMessageA(ToWindow(toggle), BM_GETCHECK, 0, 0) == BST_CHECKED; }

Handle AddLabel(Handle window, const std::string& text, int left, int top, int width, int height) {
    return ToHandle(
        AddChildWindow(window, "STATIC", text, SS_LEFT | SS_NOPREFIX, 0, left, top, width, height, 0));
}

// Read-only rather than a static, so a long path can be scrolled and copied.
Handle AddTextBox(Handle window, int left, int top, int width, int height) {
    return ToHandle(AddChildWindow(window, "EDIT", "", ES_READONLY | ES_AUTOHSCROLL, WS_EX_CLIENTEDGE, left,
                                   top, width, height, 0));
}

void SetControlText(Handle control, const std::string& text) {
    SetWindowTextA(ToWindow(control), text.c_str());
}

std::string ControlText(Handle control) {
    int length = GetWindowTextLengthA(ToWindow(control));
    if (length <= 0) return "";
    std::string text(static_cast<std::size_t>(length) + 1, '\0');
    text.resize(static_cast<std::size_t>(GetWindowTextA(ToWindow(control), text.data(), length + 1)));
    return text;
}

//--- single-column list

Handle AddListControl(Handle window, int left, int top, int width, int height, int id) {
    return ToHandle(AddChildWindow(window, "LISTBOX", "", WS_VSCROLL | LBS_NOINTEGRALHEIGHT, WS_EX_CLIENTEDGE,
                                   left, top, width, height, id));
}

void ClearListControl(Handle list) { SendMessageA(ToWindow(list), LB_RESETCONTENT, 0, 0); }

// Without LBS_SORT a line goes to the end, and the view keeps its top line.
void AppendListLine(Handle list, const std::string& text) {
    SendMessageA(ToWindow(list), LB_ADDSTRING, 0, reinterpret_cast<LPARAM>(text.c_str()));
}

//--- progress bar

Handle AddProgressBar(Handle window, int left, int top, int width, int height, int minimum, int maximum) {
    HWND bar = AddChildWindow(window, PROGRESS_CLASSA, "", 0, 0, left, top, width, height, 0);
    SendMessageA(bar, PBM_SETRANGE32, static_cast<WPARAM>(minimum), static_cast<LPARAM>(maximum));
    SendMessageA(bar, PBM_SETPOS, static_cast<WPARAM>(minimum), 0);
    return ToHandle(bar);
}

void SetProgressBarPosition(Handle bar, int position) {
    SendMessageA(ToWindow(bar), PBM_SETPOS, static_cast<WPARAM>(position), 0);
}

//--- menus

Handle CreateMenuBar() { return reinterpret_cast<Handle>(CreateMenu()); }
Handle CreateSubMenu() { return reinterpret_cast<Handle>(CreatePopupMenu()); }

void AppendMenuItem(Handle menu, const std::string& text, int id) {
    AppendMenuA(reinterpret_cast<HMENU>(menu), MF_STRING, static_cast<UINT_PTR>(id), text.c_str());
}

void AppendMenuSeparator(Handle menu) {
    AppendMenuA(reinterpret_cast<HMENU>(menu), MF_SEPARATOR, 0, nullptr);
}

void AppendSubMenu(Handle menu, const std::string& text, Handle subMenu) {
    AppendMenuA(reinterpret_cast<HMENU>(menu), MF_STRING | MF_POPUP, static_cast<UINT_PTR>(subMenu),
                text.c_str());
}

bool AttachMenuBar(Handle window, Handle menuBar) {
    if (menuBar == 0 || !SetMenu(ToWindow(window), reinterpret_cast<HMENU>(menuBar))) return false;
    DrawMenuBar(ToWindow(window));
    return true;
}

//--- events

Event WaitForEvent() {
    while (Queue.empty()) {
        MSG message;
        BOOL got = GetMessageA(&message, nullptr, 0, 0);
        if (got == 0 || got == -1) {
            // The program posts no quit message; should one come, end the loop as a close would.
            Event event;
            event.kind = EventKind::CloseRequest;
            return event;
        }
        TranslateMessage(&message);
        DispatchMessageA(&message);
    }
    return PopEvent();
}

bool TakePendingEvent(Event& event) {
    if (!Queue.empty()) {
        event = PopEvent();
        return true;
    }
    MSG message;
    if (!PeekMessageA(&message, nullptr, 0, 0, PM_REMOVE)) return false;
    TranslateMessage(&message);
    DispatchMessageA(&message);
    if (!Queue.empty()) {
        event = PopEvent();
        return true;
    }
    event = Event();
    if (message.hwnd != nullptr) event.window = ToHandle(GetAncestor(message.hwnd, GA_ROOT));
    return true;
}

//--- message box

void ShowMessageBox(const std::string& title, const std::string& text) {
    DisabledWindows disabled;
    disabled.spared = GetForegroundWindow();
    DWORD process = 0;
    if (disabled.spared != nullptr) GetWindowThreadProcessId(disabled.spared, &process);
    HWND owner = process == GetCurrentProcessId() ? disabled.spared : nullptr;
    EnumThreadWindows(GetCurrentThreadId(), DisableOne, reinterpret_cast<LPARAM>(&disabled));
    MessageBoxA(owner, text.c_str(), title.c_str(), MB_OK);
    for (HWND window : disabled.windows) EnableWindow(window, TRUE);
}
