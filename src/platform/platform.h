// The one seam to the operating system. Two implementations are chosen at link time:
// win32/ (the real program) and headless/ (unit tests and verrant-cli). Paths above the
// seam use "\" as the separator and folders end in "\"; each side maps them to its host.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

using Handle = std::uintptr_t;  // a window, control, menu or open file; 0 means none

// Once at start: common controls (version 6, as the manifest asks), COM single-threaded, and no
// critical-error boxes (a drive that is not ready just fails).
void InitPlatform();

//--- windows

struct FrameStyle {
    bool systemMenu = false;    // system menu with a close box
    bool sizingBorder = false;  // never minimize or maximize boxes
};

// Opens and shows a top-level window whose client area has the given size.
Handle OpenTopWindow(const std::string& title, int left, int top, int clientWidth, int clientHeight,
                     FrameStyle frame);
void CloseTopWindow(Handle window);
bool IsWindowOpen(Handle window);
void ActivateTopWindow(Handle window);

//--- controls: positions are in the client area; ids come back in control events

Handle AddPushButton(Handle window, const std::string& text, int left, int top, int width, int height, int id);
// A push button that stays down after a click and comes up at the next one.
Handle AddToggleButton(Handle window, const std::string& text, int left, int top, int width, int height, int id);
bool IsToggleDown(Handle toggle);
Handle AddLabel(Handle window, const std::string& text, int left, int top, int width, int height);
// A text box with a sunken edge, for showing a path.
Handle AddTextBox(Handle window, int left, int top, int width, int height);
void SetControlText(Handle control, const std::string& text);
std::string ControlText(Handle control);

//--- single-column list: insertion order, vertical scroll bar, never scrolls to a new line

Handle AddListControl(Handle window, int left, int top, int width, int height, int id);
void ClearListControl(Handle list);
void AppendListLine(Handle list, const std::string& text);

//--- progress bar

Handle AddProgressBar(Handle window, int left, int top, int width, int height, int minimum, int maximum);
void SetProgressBarPosition(Handle bar, int position);

//--- file browser list: drives at the top level, then one folder at a time

// pathWithPattern: a folder ending in "\" followed by a pattern ("*.*"), or the pattern alone for
// the top level.
Handle AddFileBrowser(Handle window, int left, int top, int width, int height, int id,
                      const std::string& pathWithPattern);
std::string BrowserCurrentFolder(Handle browser);  // ends in "\"; "" at the top level
// False when nothing is selected; isFile is false for folders, drives and the parent entry.
bool BrowserSelectedEntry(Handle browser, std::string& name, bool& isFile);

//--- menus

Handle CreateMenuBar();
Handle CreateSubMenu();
void AppendMenuItem(Handle menu, const std::string& text, int id);
void AppendMenuSeparator(Handle menu);
void AppendSubMenu(Handle menu, const std::string& text, Handle subMenu);
bool AttachMenuBar(Handle window, Handle menuBar);

//--- events

enum class EventKind { MenuItem, Control, CloseRequest, Other };

struct Event {
    Handle window = 0;   // the top-level window the event belongs to
    EventKind kind = EventKind::Other;
    int id = 0;          // menu item id or control id
    Handle control = 0;  // the control, for control events
};

// Blocks until an event is there; the event has been delivered to its window.
Event WaitForEvent();
// Takes one pending event without waiting, delivered to its window; false when none is pending.
bool TakePendingEvent(Event& event);

//--- message box: one OK button, no icon, modal over the program's windows

void ShowMessageBox(const std::string& title, const std::string& text);

//--- environment and processes

// The variable's value, "" when unset; no length limit.
std::string EnvironmentValue(const std::string& name);
std::string SystemWindowsFolder();  // without a trailing "\"
std::string SystemDriveName();      // "C:"
// The desktop folder through the shell's item list (id 0), ending in "\"; "" when unknown.
std::string DesktopFolderPath();
// Starts a process in a normal window without waiting; workingFolder "" means our own.
bool StartProcess(const std::string& commandLine, const std::string& workingFolder);
bool ShellExecuteOpen(const std::string& file, const std::string& parameters, const std::string& workingFolder);

//--- current folder and files; names are bare or full paths

bool MakeFolderCurrent(const std::string& folder);
std::string CurrentFolder();  // as the system gives it, without a trailing "\" added

Handle OpenForReading(const std::string& name);
// Creates or empties a plain file for writing. Anything else at the name (a link, hard or symbolic,
// a folder, a pipe, a device) is never opened for writing: 0 comes back.
Handle CreateForWriting(const std::string& name);
// Bytes read into buffer; 0 at the end of the file or on a failure.
std::size_t ReadBytes(Handle file, char* buffer, std::size_t size);
// Whether a read of this file failed: tells a failure from the end of the file.
bool ReadHasFailed(Handle file);
bool WriteBytes(Handle file, const char* data, std::size_t size);
// Writes everything out to the disk before returning.
bool FlushToDisk(Handle file);
// False when buffered data could not be written.
bool CloseFile(Handle file);
// Removes a plain file; a link, a folder or anything else at the name stays.
bool RemoveFile(const std::string& name);

//--- rewriting a file in place, one run at a time

enum class FileClaim {
    Taken,      // the file is the caller's to rewrite until ReleaseClaim
    NotOpened,  // no plain file there that can be read
    ReadOnly,   // marked read-only, so never replaced
    Busy,       // another run holds it
};
// Takes the file the name names (a link is followed to its target) for a rewrite in place. The
// claim keeps every other claim out until it is released or its process ends, so a run that died
// holds nothing; it never keeps a reader out.
FileClaim ClaimForRewrite(const std::string& name, Handle& claim);
// Creates the claimed file's replacement for writing where nothing is at the name yet (a link
// there is not followed), with the claimed file's mode and, where the system lets, its owner. No
// other writer gets in while it is open. 0 when anything is at the name or it cannot be made.
Handle CreateReplacement(Handle claim, const std::string& name);
// Writes the replacement out to the disk, closes it and puts it in the place of the claimed file
// (of a link's target) in one step. When that fails the replacement keeps its own name.
bool ReplaceClaimedFile(Handle claim, Handle replacement);
void ReleaseClaim(Handle claim);

struct FolderEntry {
    std::string name;
    bool isFolder = false;
};

// Lists a folder given as a pattern ("C:\mods\*.*"); "." and ".." come first, as the system gives
// them. False when the folder cannot be listed.
bool ListFolder(const std::string& pattern, std::vector<FolderEntry>& entries);
