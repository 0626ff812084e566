// What the end-to-end driver needs to work the program from outside: start and stop it, find its
// windows by title, read and dismiss message boxes, read controls and lists, ask the probe inside it,
// request screenshots, and file helpers. Failed requirements throw ScenarioStop.
#pragma once

#include "probe.h"

#include <windows.h>

#include <string>
#include <vector>

using Strings = std::vector<std::string>;

struct ScenarioStop {
    std::string why;
};

// Each scenario collects its failed expectations; a failed requirement ends the scenario.
extern Strings Failures;
bool Expect(bool ok, const std::string& what);
void Require(bool ok, const std::string& what);
void ExpectText(const std::string& actual, const std::string& expected, const std::string& what);
void ExpectLines(const Strings& actual, const Strings& expected, const std::string& what);

struct DriverSettings {
    std::string program;       // verrant.exe
    std::string probeLibrary;  // the probe DLL
    std::string workRoot;      // fixtures and start folders, ending in "\"
    std::string shotsFolder;   // "" for no screenshots
    std::string demoTree;      // the repository's demo tree, copied before use
    std::string cli;           // verrant-cli.exe, the reference for reports and rewritten catalogues
};
extern DriverSettings Settings;

struct Program {
    PROCESS_INFORMATION process = {};
    HWND main = nullptr;
    HHOOK probe = nullptr;
    double startMilliseconds = 0;  // from the start to the main window being visible
};

// Starts verrant.exe with the start folder as its current folder and waits for its main window.
Program StartProgram(const std::string& startFolder);
// The exit code, or -1 when the process is still running after the time given.
long WaitForExit(Program& program, int milliseconds);
void StopProgram(Program& program);  // ends it if it still runs, and lets go of it

std::string WindowText(HWND window);
HWND FindProgramWindow(const Program& program, const std::string& title);
HWND WaitForWindow(const Program& program, const std::string& title, int milliseconds = 5000);
bool WaitUntilGone(HWND window, int milliseconds = 5000);
// Child rectangle in the client coordinates of its parent: left, top, width, height.
RECT ChildPlace(HWND child);
RECT ClientSize(HWND window);
// Outer frame rectangle the system would give a window of that style and client size at (left, top).
RECT ExpectedFrame(HWND window, int left, int top, int clientWidth, int clientHeight);

struct MessageBoxSeen {
    HWND box = nullptr;
    std::string title, text;
    bool hasIcon = false;
    HWND owner = nullptr;
};
MessageBoxSeen WaitForMessageBox(const Program& program, int milliseconds = 5000);
bool MessageBoxShown(const Program& program);
void DismissMessageBox(const MessageBoxSeen& seen);
// Waits for a box, checks title and text, and dismisses it.
void ConfirmMessage(const Program& program, const std::string& title, const std::string& text);

Strings ListLines(HWND list);
void ClickButton(HWND button);  // posted: never waits for the program
void ChooseMenuItem(const Program& program, int id);
void PressCloseBox(HWND window);

// Asks the probe inside the program about one of its windows.
std::string Probe(Program& program, HWND window, ProbeRequest request, LPARAM row = 0);
Strings SplitLines(const std::string& text);
Strings SplitTabs(const std::string& line);

// Folder browser of a window: the rows' names, opening a row by Enter or by a double click.
Strings BrowserRowNames(Program& program, HWND window);
void OpenBrowserRow(Program& program, HWND window, const std::string& name, bool byDoubleClick);
void SelectBrowserRow(Program& program, HWND window, const std::string& name);

void Screenshot(const std::string& name);

std::string DesktopFolder();  // ends in "\"
void WriteBytes(const std::string& path, const std::string& bytes);
bool ReadBytes(const std::string& path, std::string& bytes);
bool FileExists(const std::string& path);
void MakeFolders(const std::string& folder);
// Copies a folder with everything below it; the target is made when missing.
void CopyFolder(const std::string& from, const std::string& to);
// Runs a command line in a folder with its standard output into a file; the exit code, or -1 when it
// did not start or end in time.
long RunProcess(const std::string& commandLine, const std::string& folder, const std::string& outputPath,
                int milliseconds);
// Ends processes other than the program whose top-level window title holds the text (Notepad).
int EndProcessesWithWindow(const std::string& titlePart, DWORD sparedProcess);
HWND WaitForWindowTitled(const std::string& titlePart, int milliseconds);
// The text that a Notepad window shows.
std::string NotepadText(HWND notepad);
void Pause(int milliseconds);
