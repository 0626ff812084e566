// Windows, controls, menus, events, message boxes, environment and processes, held in memory.
#include "platform/headless/headless.h"

#include <cstdio>
#ifdef __GLIBC__
#include <malloc.h>
#endif
#include <deque>
#include <map>

namespace {

std::map<Handle, HeadlessWindow> Windows;
std::map<Handle, HeadlessControl> Controls;
std::map<Handle, std::vector<HeadlessMenuItem>> Menus;
std::vector<std::string> TitlesOpened;
Handle LastHandle = 0;

std::deque<HeadlessStep> PendingSteps;
std::deque<HeadlessStep> ScriptedSteps;
int WaitsRunDry = 0;

std::vector<ShownMessage> Messages;
std::function<void(const ShownMessage&)> MessageHook;
std::vector<StartedProcess> Processes;
std::map<std::string, std::string> Environment;
std::string DesktopFolder;
bool CreateProcessWorks = true, ShellExecuteWorks = true;
bool MenuBarFails = false;
std::string FailingWindowTitle;  // OpenTopWindow of a window with this title fails
bool EchoListLines = false, EchoMessages = false;

Handle NewHandle() { return ++LastHandle; }

HeadlessControl* FindControl(Handle control) {
    auto it = Controls.find(control);
    return it == Controls.end() ? nullptr : &it->second;
}

Handle AddControl(Handle window, HeadlessControl control) {
    control.handle = NewHandle();
    auto it = Windows.find(window);
    if (it != Windows.end()) it->second.controls.push_back(control.handle);
    Controls[control.handle] = control;
    return control.handle;
}

HeadlessControl MakeControl(const std::string& kind, const std::string& text, int left, int top, int width,
                            int height, int id) {
    HeadlessControl control;
    control.kind = kind;
    control.text = text;
    control.left = left;
    control.top = top;
    control.width = width;
    control.height = height;
    control.id = id;
    return control;
}

// A click on a toggle draws its new state when it is delivered, whoever takes the event.
void Deliver(const Event& event) {
    if (event.kind != EventKind::Control) return;
    HeadlessControl* control = FindControl(event.control);
    if (control && control->kind == "toggle") control->toggleDown = !control->toggleDown;
}

Handle NewestOpenWindow() {
    for (auto it = Windows.rbegin(); it != Windows.rend(); ++it)
        if (it->second.open) return it->first;
    return 0;
}

}  // namespace

// glibc raises its threshold for giving large blocks their own pages each time such a block is
// freed; later blocks then come from the heap, which keeps what is freed. Fixed, a check that
// follows another in one run does not add its peak to the memory the first left behind.
void InitPlatform() {
#ifdef __GLIBC__
    mallopt(M_MMAP_THRESHOLD, 128 * 1024);
#endif
}

//--- windows

Handle OpenTopWindow(const std::string& title, int left, int top, int clientWidth, int clientHeight,
                     FrameStyle frame) {
    if (!FailingWindowTitle.empty() && title == FailingWindowTitle) return 0;
    HeadlessWindow window;
    window.handle = NewHandle();
    window.title = title;
    window.left = left;
    window.top = top;
    window.clientWidth = clientWidth;
    window.clientHeight = clientHeight;
    window.frame = frame;
    window.open = true;
    Windows[window.handle] = window;
    TitlesOpened.push_back(title);
    return window.handle;
}

void CloseTopWindow(Handle window) {
    auto it = Windows.find(window);
    if (it != Windows.end()) it->second.open = false;
}

bool IsWindowOpen(Handle window) {
    auto it = Windows.find(window);
    return it != Windows.end() && it->second.open;
}

void ActivateTopWindow(Handle) {}

//--- controls

Handle AddPushButton(Handle window, const std::string& text, int left, int top, int width, int height, int id) {
    return AddControl(window, MakeControl("push", text, left, top, width, height, id));
}

Handle AddToggleButton(Handle window, const std::string& text, int left, int top, int width, int height, int id) {
    return AddControl(window, MakeControl("toggle", text, left, top, width, height, id));
}

bool IsToggleDown(Handle toggle) {
    const HeadlessControl* control = FindControl(toggle);
    return control && control->toggleDown;
}

Handle AddLabel(Handle window, const std::string& text, int left, int top, int width, int height) {
    return AddControl(window, MakeControl("label", text, left, top, width, height, 0));
}

Handle AddTextBox(Handle window, int left, int top, int width, int height) {
    return AddControl(window, MakeControl("textbox", "", left, top, width, height, 0));
}

void SetControlText(Handle control, const std::string& text) {
    if (HeadlessControl* found = FindControl(control)) found->text = text;
}

std::string ControlText(Handle control) {
    const HeadlessControl* found = FindControl(control);
    return found ? found->text : std::string();
}

Handle AddListControl(Handle window, int left, int top, int width, int height, int id) {
    return AddControl(window, MakeControl("list", "", left, top, width, height, id));
}

void ClearListControl(Handle list) {
    if (HeadlessControl* found = FindControl(list)) found->lines.clear();
}

// Echoed lines are not kept as well: a run over millions of lines would hold them all.
void AppendListLine(Handle list, const std::string& text) {
    if (EchoListLines) {
        std::fwrite(text.data(), 1, text.size(), stdout);
        std::fputc('\n', stdout);
    } else if (HeadlessControl* found = FindControl(list)) {
        found->lines.push_back(text);
    }
}

Handle AddProgressBar(Handle window, int left, int top, int width, int height, int minimum, int maximum) {
    HeadlessControl control = MakeControl("progress", "", left, top, width, height, 0);
    control.minimum = minimum;
    control.maximum = maximum;
    return AddControl(window, control);
}

void SetProgressBarPosition(Handle bar, int position) {
    if (HeadlessControl* found = FindControl(bar)) {
        found->position = position;
        found->positionsSet.push_back(position);
    }
}

Handle AddFileBrowser(Handle window, int left, int top, int width, int height, int id,
                      const std::string& pathWithPattern) {
    HeadlessControl control = MakeControl("browser", "", left, top, width, height, id);
    control.browserPath = pathWithPattern;
    std::size_t slash = pathWithPattern.rfind('\\');
    control.browserFolder = slash == std::string::npos ? "" : pathWithPattern.substr(0, slash + 1);
    return AddControl(window, control);
}

std::string BrowserCurrentFolder(Handle browser) {
    const HeadlessControl* found = FindControl(browser);
    return found ? found->browserFolder : std::string();
}

bool BrowserSelectedEntry(Handle browser, std::string& name, bool& isFile) {
    const HeadlessControl* found = FindControl(browser);
    if (!found || !found->browserHasSelection) return false;
    name = found->browserSelection;
    isFile = found->browserSelectionIsFile;
    return true;
}

//--- menus

Handle CreateMenuBar() {
    if (MenuBarFails) return 0;
    Handle menu = NewHandle();
    Menus[menu];
    return menu;
}

Handle CreateSubMenu() {
    Handle menu = NewHandle();
    Menus[menu];
    return menu;
}

void AppendMenuItem(Handle menu, const std::string& text, int id) {
    HeadlessMenuItem item;
    item.text = text;
    item.id = id;
    Menus[menu].push_back(item);
}

void AppendMenuSeparator(Handle menu) {
    HeadlessMenuItem item;
    item.separator = true;
    Menus[menu].push_back(item);
}

void AppendSubMenu(Handle menu, const std::string& text, Handle subMenu) {
    HeadlessMenuItem item;
    item.text = text;
    item.subMenu = subMenu;
    Menus[menu].push_back(item);
}

bool AttachMenuBar(Handle window, Handle menuBar) {
    auto it = Windows.find(window);
    if (it == Windows.end() || menuBar == 0) return false;
    it->second.menuBar = menuBar;
    return true;
}

//--- events

Event WaitForEvent() {
    std::deque<HeadlessStep>& source = PendingSteps.empty() ? ScriptedSteps : PendingSteps;
    Event event;
    if (source.empty()) {
        // Nothing scripted is left: close the newest window, so a test cannot hang.
        ++WaitsRunDry;
        event.window = NewestOpenWindow();
        event.kind = EventKind::CloseRequest;
        return event;
    }
    HeadlessStep step = source.front();
    source.pop_front();
    event = step();
    Deliver(event);
    return event;
}

bool TakePendingEvent(Event& event) {
    if (PendingSteps.empty()) return false;
    HeadlessStep step = PendingSteps.front();
    PendingSteps.pop_front();
    event = step();
    Deliver(event);
    return true;
}

//--- message box

void ShowMessageBox(const std::string& title, const std::string& text) {
    ShownMessage message{title, text};
    Messages.push_back(message);
    if (EchoMessages) {
        std::fflush(stdout);
        std::fprintf(stderr, "%s: %s\n", title.c_str(), text.c_str());
    }
    if (MessageHook) MessageHook(message);
}

//--- environment and processes

std::string EnvironmentValue(const std::string& name) {
    auto it = Environment.find(name);
    return it == Environment.end() ? std::string() : it->second;
}

std::string SystemWindowsFolder() { return "C:\\WINDOWS"; }

std::string SystemDriveName() { return "C:"; }

std::string DesktopFolderPath() { return DesktopFolder; }

bool StartProcess(const std::string& commandLine, const std::string& workingFolder) {
    if (!CreateProcessWorks) return false;
    StartedProcess process;
    process.commandLine = commandLine;
    process.workingFolder = workingFolder;
    Processes.push_back(process);
    return true;
}

bool ShellExecuteOpen(const std::string& file, const std::string& parameters, const std::string& workingFolder) {
    if (!ShellExecuteWorks) return false;
    StartedProcess process;
    process.throughShell = true;
    process.file = file;
    process.parameters = parameters;
    process.workingFolder = workingFolder;
    Processes.push_back(process);
    return true;
}

//--- control and inspection

void HeadlessResetFiles();

void HeadlessReset() {
    Windows.clear();
    Controls.clear();
    Menus.clear();
    TitlesOpened.clear();
    PendingSteps.clear();
    ScriptedSteps.clear();
    WaitsRunDry = 0;
    Messages.clear();
    MessageHook = nullptr;
    Processes.clear();
    Environment.clear();
    DesktopFolder.clear();
    CreateProcessWorks = ShellExecuteWorks = true;
    MenuBarFails = false;
    FailingWindowTitle.clear();
    EchoListLines = EchoMessages = false;
    HeadlessResetFiles();
}

const std::vector<ShownMessage>& HeadlessMessages() { return Messages; }
const std::vector<StartedProcess>& HeadlessProcesses() { return Processes; }

Handle HeadlessFindWindow(const std::string& title) {
    for (auto it = Windows.rbegin(); it != Windows.rend(); ++it)
        if (it->second.open && it->second.title == title) return it->first;
    return 0;
}

const HeadlessWindow* HeadlessWindowOf(Handle window) {
    auto it = Windows.find(window);
    return it == Windows.end() ? nullptr : &it->second;
}

const HeadlessControl* HeadlessControlOf(Handle control) { return FindControl(control); }

Handle HeadlessControlById(Handle window, int id) {
    const HeadlessWindow* found = HeadlessWindowOf(window);
    if (!found) return 0;
    for (Handle control : found->controls)
        if (Controls[control].id == id) return control;
    return 0;
}

Handle HeadlessControlByKind(Handle window, const std::string& kind) {
    const HeadlessWindow* found = HeadlessWindowOf(window);
    if (!found) return 0;
    for (Handle control : found->controls)
        if (Controls[control].kind == kind) return control;
    return 0;
}

const std::vector<HeadlessMenuItem>& HeadlessMenuItems(Handle menu) { return Menus[menu]; }
std::vector<std::string> HeadlessWindowTitlesOpened() { return TitlesOpened; }
int HeadlessWaitsRunDry() { return WaitsRunDry; }

void HeadlessPushPending(HeadlessStep step) { PendingSteps.push_back(step); }
void HeadlessScript(HeadlessStep step) { ScriptedSteps.push_back(step); }

HeadlessStep MenuStep(const std::string& windowTitle, int id) {
    return [=] {
        Event event;
        event.window = HeadlessFindWindow(windowTitle);
        event.kind = EventKind::MenuItem;
        event.id = id;
        return event;
    };
}

HeadlessStep ControlStep(const std::string& windowTitle, int controlId) {
    return [=] {
        Event event;
        event.window = HeadlessFindWindow(windowTitle);
        event.kind = EventKind::Control;
        event.id = controlId;
        event.control = HeadlessControlById(event.window, controlId);
        return event;
    };
}

HeadlessStep CloseStep(const std::string& windowTitle) {
    return [=] {
        Event event;
        event.window = HeadlessFindWindow(windowTitle);
        event.kind = EventKind::CloseRequest;
        return event;
    };
}

HeadlessStep OtherStep(const std::string& windowTitle) {
    return [=] {
        Event event;
        event.window = HeadlessFindWindow(windowTitle);
        return event;
    };
}

HeadlessStep BrowserStep(const std::string& windowTitle, const std::string& folder, const std::string& entry,
                         bool entryIsFile) {
    return [=] {
        Event event;
        event.window = HeadlessFindWindow(windowTitle);
        event.kind = EventKind::Control;
        event.control = HeadlessControlByKind(event.window, "browser");
        if (HeadlessControl* browser = FindControl(event.control)) {
            event.id = browser->id;
            browser->browserFolder = folder;
            browser->browserSelection = entry;
            browser->browserHasSelection = !entry.empty();
            browser->browserSelectionIsFile = entryIsFile;
        }
        return event;
    };
}

void HeadlessOnMessage(std::function<void(const ShownMessage&)> hook) { MessageHook = hook; }
void HeadlessSetEnvironment(const std::string& name, const std::string& value) { Environment[name] = value; }
void HeadlessSetDesktopFolder(const std::string& folder) { DesktopFolder = folder; }

void HeadlessSetProcessStarts(bool createProcessWorks, bool shellExecuteWorks) {
    CreateProcessWorks = createProcessWorks;
    ShellExecuteWorks = shellExecuteWorks;
}

void HeadlessSetMenuBarFails(bool fails) { MenuBarFails = fails; }
void HeadlessSetWindowFails(const std::string& title) { FailingWindowTitle = title; }

void HeadlessEcho(bool listLines, bool messages) {
    EchoListLines = listLines;
    EchoMessages = messages;
}
