// Control and inspection of the headless platform: unit tests script events and read back what
// the program showed; verrant-cli sets the report folder and echoes lines and messages.
#pragma once

#include "platform/platform.h"

#include <functional>
#include <string>
#include <vector>

struct HeadlessControl {
    std::string kind;  // "push", "toggle", "label", "textbox", "list", "progress", "browser"
    Handle handle = 0;
    int id = 0;
    std::string text;
    int left = 0, top = 0, width = 0, height = 0;
    bool toggleDown = false;
    std::vector<std::string> lines;  // list control
    int minimum = 0, maximum = 0, position = 0;  // progress bar
    std::vector<int> positionsSet;               // every position the bar was set to
    std::string browserPath;                     // as given when created
    std::string browserFolder, browserSelection;
    bool browserHasSelection = false, browserSelectionIsFile = false;
};

struct HeadlessMenuItem {
    std::string text;
    int id = 0;              // 0 for separators and sub-menus
    bool separator = false;
    Handle subMenu = 0;
};

struct HeadlessWindow {
    Handle handle = 0;
    std::string title;
    int left = 0, top = 0, clientWidth = 0, clientHeight = 0;
    FrameStyle frame;
    bool open = false;
    Handle menuBar = 0;
    std::vector<Handle> controls;  // in creation order
};

struct ShownMessage {
    std::string title, text;
};

struct StartedProcess {
    std::string commandLine, workingFolder;
    bool throughShell = false;
    std::string file, parameters;  // shell execute only
};

// Faults the file layer injects, matched on the bare file name, for tests of failure paths.
struct HeadlessFileFaults {
    std::string failOpen;                   // OpenForReading and ClaimForRewrite of this name fail
    std::string failCreate;                 // CreateForWriting and CreateReplacement of this name fail
    std::string failReadName;               // reads of this file fail once ...
    long long failReadAfterBytes = -1;      // ... this many bytes have been read
    std::string failWriteName;              // writes to this file fail once ...
    long long failWriteAfterBytes = -1;     // ... this many bytes have been written
    bool failReplace = false;               // ReplaceClaimedFile fails
    bool failRemove = false;                // RemoveFile fails
};

void HeadlessReset();

// What the program did.
const std::vector<ShownMessage>& HeadlessMessages();
const std::vector<StartedProcess>& HeadlessProcesses();
Handle HeadlessFindWindow(const std::string& title);  // the newest open window of that title; 0 if none
const HeadlessWindow* HeadlessWindowOf(Handle window);
const HeadlessControl* HeadlessControlOf(Handle control);
Handle HeadlessControlById(Handle window, int id);
Handle HeadlessControlByKind(Handle window, const std::string& kind);  // the first of that kind
const std::vector<HeadlessMenuItem>& HeadlessMenuItems(Handle menu);
std::vector<std::string> HeadlessWindowTitlesOpened();  // every window ever opened, in order
int HeadlessWaitsRunDry();  // how often WaitForEvent found no scripted event

// Events. A step runs when its event arrives and gives the event; it may change control state
// first (a browser pick). Pending steps are seen by TakePendingEvent and WaitForEvent; scripted
// steps arrive only through WaitForEvent, after the pending ones.
using HeadlessStep = std::function<Event()>;
void HeadlessPushPending(HeadlessStep step);
void HeadlessScript(HeadlessStep step);
HeadlessStep MenuStep(const std::string& windowTitle, int id);
HeadlessStep ControlStep(const std::string& windowTitle, int controlId);
HeadlessStep CloseStep(const std::string& windowTitle);
HeadlessStep OtherStep(const std::string& windowTitle);
// Points the browser of that window at a folder and selects an entry ("" selects nothing).
HeadlessStep BrowserStep(const std::string& windowTitle, const std::string& folder, const std::string& entry,
                         bool entryIsFile);
// Runs after every message box is shown, as the user would act while it is open.
void HeadlessOnMessage(std::function<void(const ShownMessage&)> hook);

// Environment and the shell.
void HeadlessSetEnvironment(const std::string& name, const std::string& value);
void HeadlessSetDesktopFolder(const std::string& folder);
void HeadlessSetProcessStarts(bool createProcessWorks, bool shellExecuteWorks);
void HeadlessSetFileFaults(const HeadlessFileFaults& faults);
void HeadlessSetMenuBarFails(bool fails);
void HeadlessSetWindowFails(const std::string& title);  // opening a window of this title fails

// verrant-cli: list lines to standard output (and not kept), message boxes to standard error as
// "Title: text".
void HeadlessEcho(bool listLines, bool messages);

// Host path of a program path ("\" turned into the host's separator); no case matching.
std::string HeadlessHostPath(const std::string& programPath);
// Program path of a host path: absolute, "\" separators, no trailing "\".
std::string HeadlessProgramPath(const std::string& hostPath);
// Counters of the file layer, for tests and benchmarks of file-system work.
struct HeadlessFileCounters {
    long long opens = 0, listings = 0;
    long long caseListings = 0;  // folders listed to match a name's letter case
};
HeadlessFileCounters HeadlessCounters();
// "host path: the system's reason" of the latest file operation when it failed, "" when it went
// well; forgotten once taken. Closing and removing files leave it alone.
std::string HeadlessTakeFailure();
