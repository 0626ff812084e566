#include "driver_support.h"

#include <shlobj.h>

#include <algorithm>

Strings Failures;
DriverSettings Settings;

namespace {

const int PollMilliseconds = 20;

double Now() {
    LARGE_INTEGER count, frequency;
    QueryPerformanceCounter(&count);
    QueryPerformanceFrequency(&frequency);
    return 1000.0 * static_cast<double>(count.QuadPart) / static_cast<double>(frequency.QuadPart);
}

std::string Narrow(const std::wstring& wide) {
    if (wide.empty()) return "";
    int size = WideCharToMultiByte(CP_ACP, 0, wide.data(), static_cast<int>(wide.size()), nullptr, 0, nullptr,
                                   nullptr);
    std::string text(static_cast<std::size_t>(size), '\0');
    WideCharToMultiByte(CP_ACP, 0, wide.data(), static_cast<int>(wide.size()), text.data(), size, nullptr,
                        nullptr);
    return text;
}

struct WindowSearch {
    DWORD process = 0;
    std::string title;
    const char* windowClass = nullptr;
    HWND found = nullptr;
};

BOOL CALLBACK MatchWindow(HWND window, LPARAM data) {
    auto* search = reinterpret_cast<WindowSearch*>(data);
    DWORD process = 0;
    GetWindowThreadProcessId(window, &process);
    if (process != search->process || !IsWindowVisible(window)) return TRUE;
    if (search->windowClass != nullptr) {
        char name[64] = "";
        GetClassNameA(window, name, sizeof name);
        if (lstrcmpA(name, search->windowClass) != 0) return TRUE;
    } else if (WindowText(window) != search->title) {
        return TRUE;
    }
    search->found = window;
    return FALSE;
}

HWND FindWindowOf(DWORD process, const std::string& title, const char* windowClass) {
    WindowSearch search;
    search.process = process;
    search.title = title;
    search.windowClass = windowClass;
    EnumWindows(MatchWindow, reinterpret_cast<LPARAM>(&search));
    return search.found;
}

std::string ProbeAnswerPath() { return Settings.workRoot + "probe-answer.txt"; }

HWND BrowserOf(HWND window) { return FindWindowExA(window, nullptr, "SysListView32", nullptr); }

int RowIndex(Program& program, HWND window, const std::string& name) {
    Strings names = BrowserRowNames(program, window);
    auto it = std::find(names.begin(), names.end(), name);
    Require(it != names.end(), "browser row \"" + name + "\" is shown");
    return static_cast<int>(it - names.begin());
}

struct TitleSearch {
    std::string part;
    DWORD spared = 0;
    std::vector<DWORD> processes;
    HWND first = nullptr;
};

BOOL CALLBACK MatchTitle(HWND window, LPARAM data) {
    auto* search = reinterpret_cast<TitleSearch*>(data);
    DWORD process = 0;
    GetWindowThreadProcessId(window, &process);
    if (process == search->spared || process == GetCurrentProcessId()) return TRUE;
    if (WindowText(window).find(search->part) == std::string::npos) return TRUE;
    if (search->first == nullptr) search->first = window;
    if (std::find(search->processes.begin(), search->processes.end(), process) == search->processes.end())
        search->processes.push_back(process);
    return TRUE;
}

}  // namespace

bool Expect(bool ok, const std::string& what) {
    if (!ok) Failures.push_back(what);
    return ok;
}

void Require(bool ok, const std::string& what) {
    if (!ok) throw ScenarioStop{what};
}

void ExpectText(const std::string& actual, const std::string& expected, const std::string& what) {
    Expect(actual == expected, what + ": \"" + actual + "\" instead of \"" + expected + "\"");
}

void ExpectLines(const Strings& actual, const Strings& expected, const std::string& what) {
    if (actual == expected) return;
    std::size_t i = 0;
    while (i < actual.size() && i < expected.size() && actual[i] == expected[i]) ++i;
    std::string seen = i < actual.size() ? "\"" + actual[i] + "\"" : "(none)";
    std::string wanted = i < expected.size() ? "\"" + expected[i] + "\"" : "(none)";
    Failures.push_back(what + ": " + std::to_string(actual.size()) + " lines instead of " +
                       std::to_string(expected.size()) + "; line " + std::to_string(i + 1) + " is " + seen +
                       ", expected " + wanted);
}

void Pause(int milliseconds) { Sleep(static_cast<DWORD>(milliseconds)); }

//--- the program

Program StartProgram(const std::string& startFolder) {
    Program program;
    std::string line = "\"" + Settings.program + "\"";
    STARTUPINFOA startup = {};
    startup.cb = sizeof startup;
    double started = Now();
    Require(CreateProcessA(nullptr, line.data(), nullptr, nullptr, FALSE, 0, nullptr, startFolder.c_str(),
                           &startup, &program.process),
            "verrant.exe starts");
    for (double waited = 0; waited < 10000; waited = Now() - started) {
        program.main = FindWindowOf(program.process.dwProcessId, "Verrant V.1.3", nullptr);
        if (program.main != nullptr) break;
        Sleep(5);
    }
    program.startMilliseconds = Now() - started;
    if (program.main == nullptr) {
        StopProgram(program);
        Require(false, "the main window \"Verrant V.1.3\" appears");
    }
    HMODULE library = LoadLibraryA(Settings.probeLibrary.c_str());
    FARPROC found = library ? GetProcAddress(library, "ProbeHook") : nullptr;
    auto hook = reinterpret_cast<HOOKPROC>(reinterpret_cast<void*>(found));
    DWORD thread = GetWindowThreadProcessId(program.main, nullptr);
    if (hook != nullptr) program.probe = SetWindowsHookExA(WH_GETMESSAGE, hook, library, thread);
    Expect(program.probe != nullptr, "the probe hooks into the program's thread");
    return program;
}

long WaitForExit(Program& program, int milliseconds) {
    if (program.process.hProcess == nullptr) return -1;
    if (WaitForSingleObject(program.process.hProcess, static_cast<DWORD>(milliseconds)) != WAIT_OBJECT_0)
        return -1;
    DWORD code = 0;
    GetExitCodeProcess(program.process.hProcess, &code);
    return static_cast<long>(code);
}

void StopProgram(Program& program) {
    if (program.probe != nullptr) UnhookWindowsHookEx(program.probe);
    program.probe = nullptr;
    if (program.process.hProcess == nullptr) return;
    if (WaitForSingleObject(program.process.hProcess, 0) != WAIT_OBJECT_0) {
        TerminateProcess(program.process.hProcess, 99);
        WaitForSingleObject(program.process.hProcess, 5000);
    }
    CloseHandle(program.process.hThread);
    CloseHandle(program.process.hProcess);
    program.process = PROCESS_INFORMATION();
}

//--- windows

// Another process's text comes back as UTF-16 under Wine whatever the call: ask for it so.
std::string WindowText(HWND window) {
    DWORD_PTR length = 0;
    if (!SendMessageTimeoutW(window, WM_GETTEXTLENGTH, 0, 0, SMTO_ABORTIFHUNG, 2000, &length)) return "";
    std::wstring text(length + 1, L'\0');
    DWORD_PTR copied = 0;
    SendMessageTimeoutW(window, WM_GETTEXT, length + 1, reinterpret_cast<LPARAM>(text.data()),
                        SMTO_ABORTIFHUNG, 2000, &copied);
    text.resize(copied);
    return Narrow(text);
}

HWND FindProgramWindow(const Program& program, const std::string& title) {
    return FindWindowOf(program.process.dwProcessId, title, nullptr);
}

HWND WaitForWindow(const Program& program, const std::string& title, int milliseconds) {
    for (int waited = 0;; waited += PollMilliseconds) {
        if (HWND window = FindProgramWindow(program, title)) return window;
        if (waited >= milliseconds) return nullptr;
        Sleep(PollMilliseconds);
    }
}

bool WaitUntilGone(HWND window, int milliseconds) {
    for (int waited = 0; IsWindow(window) && IsWindowVisible(window); waited += PollMilliseconds) {
        if (waited >= milliseconds) return false;
        Sleep(PollMilliseconds);
    }
    return true;
}

RECT ChildPlace(HWND child) {
    RECT place;
    GetWindowRect(child, &place);
    MapWindowPoints(nullptr, GetParent(child), reinterpret_cast<POINT*>(&place), 2);
    return {place.left, place.top, place.right - place.left, place.bottom - place.top};
}

RECT ClientSize(HWND window) {
    RECT client = {};
    GetClientRect(window, &client);
    return client;
}

RECT ExpectedFrame(HWND window, int left, int top, int clientWidth, int clientHeight) {
    RECT frame = {0, 0, clientWidth, clientHeight};
    AdjustWindowRectEx(&frame, static_cast<DWORD>(GetWindowLongA(window, GWL_STYLE)), FALSE,
                       static_cast<DWORD>(GetWindowLongA(window, GWL_EXSTYLE)));
    return {left, top, left + frame.right - frame.left, top + frame.bottom - frame.top};
}

//--- message boxes

MessageBoxSeen WaitForMessageBox(const Program& program, int milliseconds) {
    MessageBoxSeen seen;
    for (int waited = 0; seen.box == nullptr; waited += PollMilliseconds) {
        seen.box = FindWindowOf(program.process.dwProcessId, "", "#32770");
        if (seen.box != nullptr) break;
        Require(waited < milliseconds, "a message box appears");
        Sleep(PollMilliseconds);
    }
    Sleep(50);  // let it finish drawing before it is read
    seen.title = WindowText(seen.box);
    seen.text = WindowText(GetDlgItem(seen.box, 0xFFFF));
    // The icon static is there even when the box has no icon; what counts is whether it holds one.
    for (HWND child = GetWindow(seen.box, GW_CHILD); child != nullptr;
         child = GetWindow(child, GW_HWNDNEXT)) {
        DWORD_PTR icon = 0;
        SendMessageTimeoutW(child, STM_GETICON, 0, 0, SMTO_ABORTIFHUNG, 2000, &icon);
        if (icon != 0) seen.hasIcon = true;
    }
    seen.owner = GetWindow(seen.box, GW_OWNER);
    return seen;
}

bool MessageBoxShown(const Program& program) {
    return FindWindowOf(program.process.dwProcessId, "", "#32770") != nullptr;
}

void DismissMessageBox(const MessageBoxSeen& seen) {
    PostMessageA(GetDlgItem(seen.box, IDOK), BM_CLICK, 0, 0);
    Require(WaitUntilGone(seen.box), "message box \"" + seen.title + "\" goes away with OK");
}

void ConfirmMessage(const Program& program, const std::string& title, const std::string& text) {
    MessageBoxSeen seen = WaitForMessageBox(program);
    ExpectText(seen.title, title, "message box title");
    ExpectText(seen.text, text, "message box text of \"" + title + "\"");
    Expect(!seen.hasIcon, "message box \"" + title + "\" has no icon");
    DismissMessageBox(seen);
}

//--- controls

Strings ListLines(HWND list) {
    Strings lines;
    DWORD_PTR count = 0;
    SendMessageTimeoutW(list, LB_GETCOUNT, 0, 0, SMTO_ABORTIFHUNG, 2000, &count);
    for (DWORD_PTR i = 0; i < count; ++i) {
        DWORD_PTR length = 0;
        SendMessageTimeoutW(list, LB_GETTEXTLEN, i, 0, SMTO_ABORTIFHUNG, 2000, &length);
        std::wstring text(length + 1, L'\0');
        DWORD_PTR copied = 0;
        SendMessageTimeoutW(list, LB_GETTEXT, i, reinterpret_cast<LPARAM>(text.data()), SMTO_ABORTIFHUNG,
                            2000, &copied);
        text.resize(std::min<DWORD_PTR>(copied, length));
        lines.push_back(Narrow(text));
    }
    return lines;
}

void ClickButton(HWND button) { PostMessageA(button, BM_CLICK, 0, 0); }

void ChooseMenuItem(const Program& program, int id) {
    PostMessageA(program.main, WM_COMMAND, static_cast<WPARAM>(id), 0);
}

void PressCloseBox(HWND window) { PostMessageA(window, WM_SYSCOMMAND, SC_CLOSE, 0); }

//--- the probe

std::string Probe(Program& program, HWND window, ProbeRequest request, LPARAM row) {
    static const UINT message = RegisterWindowMessageA(PROBE_MESSAGE_NAME);
    Require(program.probe != nullptr, "the probe is in the program");
    std::string path = ProbeAnswerPath();
    DeleteFileA(path.c_str());
    PostMessageA(window, message, static_cast<WPARAM>(request), row);
    std::string answer;
    for (int waited = 0; !ReadBytes(path, answer); waited += PollMilliseconds) {
        Require(waited < 5000, "the probe answers");
        Sleep(PollMilliseconds);
    }
    DeleteFileA(path.c_str());
    return answer;
}

Strings SplitLines(const std::string& text) {
    Strings lines;
    std::size_t start = 0;
    while (start < text.size()) {
        std::size_t end = text.find('\n', start);
        if (end == std::string::npos) end = text.size();
        lines.push_back(text.substr(start, end - start));
        start = end + 1;
    }
    return lines;
}

Strings SplitTabs(const std::string& line) {
    Strings fields;
    std::size_t start = 0;
    for (;;) {
        std::size_t end = line.find('\t', start);
        fields.push_back(line.substr(start, end == std::string::npos ? std::string::npos : end - start));
        if (end == std::string::npos) return fields;
        start = end + 1;
    }
}

Strings BrowserRowNames(Program& program, HWND window) {
    Strings names;
    Strings lines = SplitLines(Probe(program, window, ProbeRows));
    for (std::size_t i = 1; i < lines.size(); ++i) {
        Strings fields = SplitTabs(lines[i]);
        if (fields.size() >= 2) names.push_back(fields[1]);
    }
    return names;
}

void SelectBrowserRow(Program& program, HWND window, const std::string& name) {
    Probe(program, window, ProbeSelectRow, RowIndex(program, window, name));
}

void OpenBrowserRow(Program& program, HWND window, const std::string& name, bool byDoubleClick) {
    int row = RowIndex(program, window, name);
    Probe(program, window, ProbeSelectRow, row);
    HWND list = BrowserOf(window);
    if (byDoubleClick) {
        Strings point = SplitTabs(SplitLines(Probe(program, window, ProbeRowPoint, row)).at(0));
        LPARAM at = MAKELPARAM(std::stoi(point.at(0)), std::stoi(point.at(1)));
        PostMessageA(list, WM_LBUTTONDBLCLK, MK_LBUTTON, at);
        PostMessageA(list, WM_LBUTTONUP, 0, at);
    } else {
        PostMessageA(list, WM_KEYDOWN, VK_RETURN, 0x001C0001);
        PostMessageA(list, WM_KEYUP, VK_RETURN, static_cast<LPARAM>(0xC01C0001u));
    }
}

//--- screenshots: the test script watches for requests and takes them with ImageMagick

void Screenshot(const std::string& name) {
    if (Settings.shotsFolder.empty()) return;
    Sleep(300);  // let every window finish painting
    std::string request = Settings.shotsFolder + name + ".request";
    WriteBytes(request, name);
    for (int waited = 0; FileExists(request) && waited < 15000; waited += PollMilliseconds)
        Sleep(PollMilliseconds);
}

//--- files

std::string DesktopFolder() {
    LPITEMIDLIST items = nullptr;
    char path[MAX_PATH] = "";
    if (SUCCEEDED(SHGetSpecialFolderLocation(nullptr, 0, &items)) && items != nullptr) {
        SHGetPathFromIDListA(items, path);
        CoTaskMemFree(items);
    }
    std::string folder = path;
    if (!folder.empty() && folder.back() != '\\') folder += '\\';
    return folder;
}

void WriteBytes(const std::string& path, const std::string& bytes) {
    HANDLE file =
        CreateFileA(path.c_str(), GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, FILE_ATTRIBUTE_NORMAL, nullptr);
    Require(file != INVALID_HANDLE_VALUE, "can write " + path);
    DWORD written = 0;
    WriteFile(file, bytes.data(), static_cast<DWORD>(bytes.size()), &written, nullptr);
    CloseHandle(file);
}

bool ReadBytes(const std::string& path, std::string& bytes) {
    HANDLE file =
        CreateFileA(path.c_str(), GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE,
                    nullptr, OPEN_EXISTING, FILE_ATTRIBUTE_NORMAL, nullptr);
    if (file == INVALID_HANDLE_VALUE) return false;
    bytes.clear();
    char buffer[4096];
    DWORD got = 0;
    while (ReadFile(file, buffer, sizeof buffer, &got, nullptr) && got > 0) bytes.append(buffer, got);
    CloseHandle(file);
    return true;
}

bool FileExists(const std::string& path) {
    return GetFileAttributesA(path.c_str()) != INVALID_FILE_ATTRIBUTES;
}

void MakeFolders(const std::string& folder) {
    for (std::size_t slash = folder.find('\\', 3); slash != std::string::npos;
         slash = folder.find('\\', slash + 1))
        CreateDirectoryA(folder.substr(0, slash).c_str(), nullptr);
    CreateDirectoryA(folder.c_str(), nullptr);
}

void CopyFolder(const std::string& from, const std::string& to) {
    MakeFolders(to);
    WIN32_FIND_DATAA entry;
    HANDLE search = FindFirstFileA((from + "\\*").c_str(), &entry);
    Require(search != INVALID_HANDLE_VALUE, "can list " + from);
    do {
        std::string name = entry.cFileName;
        if (name == "." || name == "..") continue;
        std::string source = from + "\\" + name, target = to + "\\" + name;
        if (entry.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY)
            CopyFolder(source, target);
        else
            Require(CopyFileA(source.c_str(), target.c_str(), FALSE) != FALSE, "can copy " + source);
    } while (FindNextFileA(search, &entry));
    FindClose(search);
}

long RunProcess(const std::string& commandLine, const std::string& folder, const std::string& outputPath,
                int milliseconds) {
    SECURITY_ATTRIBUTES inherited = {sizeof inherited, nullptr, TRUE};
    HANDLE output = CreateFileA(outputPath.c_str(), GENERIC_WRITE, FILE_SHARE_READ, &inherited, CREATE_ALWAYS,
                                FILE_ATTRIBUTE_NORMAL, nullptr);
    if (output == INVALID_HANDLE_VALUE) return -1;
    STARTUPINFOA startup = {};
    startup.cb = sizeof startup;
    startup.dwFlags = STARTF_USESTDHANDLES;
    startup.hStdInput = GetStdHandle(STD_INPUT_HANDLE);
    startup.hStdOutput = output;
    startup.hStdError = GetStdHandle(STD_ERROR_HANDLE);
    PROCESS_INFORMATION process = {};
    std::string line = commandLine;
    bool started = CreateProcessA(nullptr, line.data(), nullptr, nullptr, TRUE, 0, nullptr, folder.c_str(),
                                  &startup, &process) != FALSE;
    CloseHandle(output);
    if (!started) return -1;
    DWORD code = 0;
    bool ended = WaitForSingleObject(process.hProcess, static_cast<DWORD>(milliseconds)) == WAIT_OBJECT_0;
    if (ended) {
        GetExitCodeProcess(process.hProcess, &code);
    } else {
        TerminateProcess(process.hProcess, 99);
        WaitForSingleObject(process.hProcess, 5000);
    }
    CloseHandle(process.hThread);
    CloseHandle(process.hProcess);
    return ended ? static_cast<long>(code) : -1;
}

int EndProcessesWithWindow(const std::string& titlePart, DWORD sparedProcess) {
    TitleSearch search;
    search.part = titlePart;
    search.spared = sparedProcess;
    EnumWindows(MatchTitle, reinterpret_cast<LPARAM>(&search));
    for (DWORD process : search.processes) {
        if (HANDLE handle = OpenProcess(PROCESS_TERMINATE | SYNCHRONIZE, FALSE, process)) {
            TerminateProcess(handle, 0);
            WaitForSingleObject(handle, 5000);
            CloseHandle(handle);
        }
    }
    return static_cast<int>(search.processes.size());
}

HWND WaitForWindowTitled(const std::string& titlePart, int milliseconds) {
    for (int waited = 0;; waited += PollMilliseconds) {
        TitleSearch search;
        search.part = titlePart;
        EnumWindows(MatchTitle, reinterpret_cast<LPARAM>(&search));
        if (search.first != nullptr) return search.first;
        if (waited >= milliseconds) return nullptr;
        Sleep(PollMilliseconds);
    }
}

std::string NotepadText(HWND notepad) { return WindowText(FindWindowExA(notepad, nullptr, "Edit", nullptr)); }
