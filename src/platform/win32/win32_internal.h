// What the Win32 side's files share: handle conversion, the event queue, the font, the file browser
// hooks of the window procedure and shell folder paths.
#pragma once

#include "platform/platform.h"

#include <windows.h>

#include <string>

inline HWND ToWindow(Handle handle) { return reinterpret_cast<HWND>(handle); }
inline Handle ToHandle(HWND window) { return reinterpret_cast<Handle>(window); }

void EnqueueEvent(const Event& event);
// The message font of the desktop, so captions fit where the layout puts them.
HFONT GuiFont();
HWND AddChildWindow(Handle window, const char* windowClass, const std::string& text, DWORD style,
                    DWORD extendedStyle, int left, int top, int width, int height, int id);

// A notification from a child of a top-level window; queues a control event when it was one of a
// file browser's.
void NotifyFileBrowser(HWND window, const NMHDR& header);
void ForgetFileBrowsersOf(HWND window);

// The path of a shell special folder, without a trailing "\"; "" when the shell has none.
std::string ShellFolderPath(int folderId);
