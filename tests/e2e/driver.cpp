// The end-to-end driver: starts verrant.exe under Wine in fresh start folders, works it through its
// windows as a user would, and checks what only real windows show; reports and rewritten catalogues
// are compared with verrant-cli.exe's. Prints one line per scenario and ends with "N passed, M failed".
//   e2e_driver.exe PROGRAM PROBE_DLL WORK_FOLDER SHOTS_FOLDER VERRANT_CLI
// run-e2e.sh puts two copies of the demo tree into the work folder, "demo" for the program and
// "demo-cli" for verrant-cli.exe, and the generated tree "mesh-big".
#include "probe.h"

#include <windows.h>

#include <commctrl.h>
#include <shlobj.h>

#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <functional>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

using Strings = std::vector<std::string>;
using Windows = std::vector<HWND>;

Strings Failures;  // of the running scenario
PROCESS_INFORMATION App = {};
HWND Main = nullptr;
HHOOK ProbeHook = nullptr;
std::string ProgramPath, ProbeLibrary, WorkRoot, ShotsFolder, CliPath, Desktop;  // folders end in "\\"
const std::string CatalogueTail = "mods\\std\\com\\maddox\\il2\\objects\\";

bool Expect(bool ok, const std::string& what) {
    if (!ok) Failures.push_back(what);
    return ok;
}

void Require(bool ok, const std::string& what) {
    if (!ok) throw std::runtime_error(what);
}

void ExpectLines(const Strings& actual, const Strings& expected, const std::string& what) {
    auto [seen, wanted] = std::mismatch(actual.begin(), actual.end(), expected.begin(), expected.end());
    if (seen != actual.end() || wanted != expected.end())
        Failures.push_back(what + ": line " + std::to_string(seen - actual.begin() + 1) + " is \"" +
                           (seen == actual.end() ? "(none)" : *seen) + "\", expected \"" +
                           (wanted == expected.end() ? "(none)" : *wanted) + "\"");
}

std::string Work(const std::string& relative) { return WorkRoot + relative; }

bool Within(int milliseconds, const std::function<bool()>& done) {
    for (int waited = 0; !done(); waited += 20) {
        if (waited >= milliseconds) return false;
        Sleep(20);
    }
    return true;
}

Strings SplitLines(const std::string& text) {
    Strings lines;
    std::istringstream in(text);
    for (std::string line; std::getline(in, line);)
        lines.push_back(line.substr(0, line.find_last_not_of('\r') + 1));
    return lines;
}

std::string FileBytes(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    Require(file.is_open(), "can read " + path);
    return {std::istreambuf_iterator<char>(file), {}};
}

void WriteBytes(const std::string& path, const std::string& bytes) {
    Require(static_cast<bool>(std::ofstream(path, std::ios::binary) << bytes), "can write " + path);
}

// Another process's text comes back as UTF-16 under Wine whatever the call; the program's is ASCII.
std::string WindowText(HWND window) {
    static wchar_t text[1 << 20];
    DWORD_PTR length = 0;
    SendMessageTimeoutW(window, WM_GETTEXT, 1 << 20, reinterpret_cast<LPARAM>(text), SMTO_ABORTIFHUNG, 2000,
                        &length);
    return std::string(text, text + length);
}

// Visible top-level windows of the program (or of any process) by a part of the title and the class.
Windows TopWindows(const std::string& titlePart, const char* windowClass = nullptr, bool anyProcess = false) {
    Windows found;
    for (HWND window = nullptr; (window = FindWindowExA(nullptr, window, windowClass, nullptr));) {
        DWORD process = 0;
        GetWindowThreadProcessId(window, &process);
        if ((anyProcess || process == App.dwProcessId) && IsWindowVisible(window) &&
            WindowText(window).find(titlePart) != std::string::npos)
            found.push_back(window);
    }
    return found;
}

HWND WaitForWindow(const std::string& title, int milliseconds = 5000) {
    Windows found;
    Require(Within(milliseconds, [&] { return !(found = TopWindows(title)).empty(); }),
            "the window \"" + title + "\" opens");
    return found[0];
}

bool Gone(HWND window) {
    return Within(5000, [&] { return !IsWindow(window) || !IsWindowVisible(window); });
}

HWND Control(HWND window, const char* windowClass, int index = 0) {
    HWND child = nullptr;
    for (int i = 0; i <= index; ++i) child = FindWindowExA(window, child, windowClass, nullptr);
    return child;
}

void Click(HWND button) { PostMessageA(button, BM_CLICK, 0, 0); }

// As a click into its menu bar would, this makes the main window the foreground window.
void ChooseMenuItem(int id) {
    SetForegroundWindow(Main);
    PostMessageA(Main, WM_COMMAND, static_cast<WPARAM>(id), 0);
}

Strings ListLines(HWND list) {
    Strings lines;
    static wchar_t text[4096];
    for (LRESULT i = 0; i < SendMessageW(list, LB_GETCOUNT, 0, 0); ++i)
        lines.emplace_back(text, text + SendMessageW(list, LB_GETTEXT, i, reinterpret_cast<LPARAM>(text)));
    return lines;
}

// The test script watches for NAME.request files and takes a screenshot for each.
void Screenshot(const std::string& name) {
    Sleep(300);  // let every window finish painting
    std::string request = ShotsFolder + name + ".request";
    WriteBytes(request, name);
    Within(15000, [&] { return !std::filesystem::exists(request); });
}

// Starts verrant.exe in a start folder of its own, with a settings file if given, and hooks in the probe.
void Start(const std::string& name, const std::string& settings = "") {
    std::string folder = Work("start\\" + name + "\\"), line = "\"" + ProgramPath + "\"";
    std::filesystem::create_directories(folder);
    if (!settings.empty()) WriteBytes(folder + "verrant.ini", settings);
    STARTUPINFOA startup = {};
    startup.cb = sizeof startup;
    Require(CreateProcessA(nullptr, line.data(), nullptr, nullptr, FALSE, 0, nullptr, folder.c_str(),
                           &startup, &App),
            "verrant.exe starts");
    Main = WaitForWindow("Verrant V.1.3", 10000);
    HMODULE library = LoadLibraryA(ProbeLibrary.c_str());
    auto hook = reinterpret_cast<HOOKPROC>(reinterpret_cast<void*>(GetProcAddress(library, "ProbeHook")));
    ProbeHook = SetWindowsHookExA(WH_GETMESSAGE, hook, library, GetWindowThreadProcessId(Main, nullptr));
    Require(ProbeHook != nullptr, "the probe hooks into the program's thread");
}

void Close(bool byCloseBox = false) {
    byCloseBox ? (void)PostMessageA(Main, WM_SYSCOMMAND, SC_CLOSE, 0) : ChooseMenuItem(1);
    DWORD code = 99;
    Expect(WaitForSingleObject(App.hProcess, 5000) == WAIT_OBJECT_0 &&
               GetExitCodeProcess(App.hProcess, &code) && code == 0,
           std::string(byCloseBox ? "the close box" : "\"Close\"") + " ends the program with exit code 0");
}

// Ends what a scenario left running: any Notepad, and the program.
void Stop() {
    if (ProbeHook) UnhookWindowsHookEx(ProbeHook);
    for (HWND notepad : TopWindows("", "Notepad", true)) PostMessageA(notepad, WM_CLOSE, 0, 0);
    TerminateProcess(App.hProcess, 99),
        WaitForSingleObject(App.hProcess, 5000);  // fails harmlessly once it has ended
    CloseHandle(App.hThread), CloseHandle(App.hProcess);
    App = {}, Main = nullptr, ProbeHook = nullptr;
}

Strings Probe(HWND window, ProbeRequest request, int row = 0) {
    static const UINT message = RegisterWindowMessageA(PROBE_MESSAGE_NAME);
    std::string path = Work("probe-answer.txt");
    DeleteFileA(path.c_str());
    PostMessageA(window, message, request, row);
    Require(Within(5000, [&] { return std::filesystem::exists(path); }), "the probe answers");
    return SplitLines(FileBytes(path));
}

// Selects or opens a row of a window's file browser by its name.
void UseRow(HWND window, const std::string& name, ProbeRequest how) {
    Strings rows = Probe(window, ProbeRows);
    auto row = std::find(rows.begin(), rows.end(), name);
    Require(row != rows.end(), "the browser shows \"" + name + "\"");
    Probe(window, how, static_cast<int>(row - rows.begin()));
}

// The chooser's path box, or the status line of the missing objects window.
bool PathBoxShows(HWND window, const std::string& text) {
    return Within(5000, [&] { return WindowText(Control(window, "Edit")) == text; });
}

void OpenRow(HWND chooser, const std::string& name, ProbeRequest how, const std::string& reached) {
    UseRow(chooser, name, how);
    Require(PathBoxShows(chooser, reached), "opening \"" + name + "\" shows " + reached + " in the path box");
}

// A message box: title, text, no icon, its owner if given (a box shown while no window of the program is
// in front has none), every other window of the program disabled while it shows and enabled after OK.
void ConfirmMessage(const std::string& title, const std::string& text, HWND owner = nullptr) {
    Windows boxes;
    Require(Within(5000, [&] { return !(boxes = TopWindows("", "#32770")).empty(); }),
            "the message box \"" + title + "\" shows");
    Sleep(50);  // let it finish drawing before it is read
    Windows others = TopWindows("");
    std::string seen = WindowText(boxes[0]) + ": " + WindowText(GetDlgItem(boxes[0], 0xFFFF));
    Expect(seen == title + ": " + text,
           "message box \"" + seen + "\", expected \"" + title + ": " + text + "\"");
    Expect(owner == nullptr || GetWindow(boxes[0], GW_OWNER) == owner,
           "\"" + title + "\" is owned by \"" + WindowText(owner) + "\"");
    // The icon static is there even with no icon; what counts is whether it holds one.
    for (HWND child = GetWindow(boxes[0], GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT))
        Expect(SendMessageW(child, STM_GETICON, 0, 0) == 0, "\"" + title + "\" has no icon");
    std::erase(others, boxes[0]);
    for (HWND window : others)
        Expect(!IsWindowEnabled(window), WindowText(window) + " is disabled under " + title);
    PostMessageA(GetDlgItem(boxes[0], IDOK), BM_CLICK, 0, 0);
    Require(Gone(boxes[0]), "\"" + title + "\" goes away with OK");
    for (HWND window : others)
        Expect(Within(2000, [&] { return !IsWindow(window) || IsWindowEnabled(window); }),
               WindowText(window) + " is enabled again after " + title);
}

// Each window's place, client size and frame, then its controls in the order of creation: class, text,
// place and traits. A caption that does not fit, or the bold system font, shows in the probe's answer.
const std::pair<const char*, Strings> Layouts[] = {
    {"Verrant V.1.3",
     {"250,250 270x110 caption sysmenu sizing", "Button\tOpen static.ini\t5,15 80x22",
      "Button\tList searching\t5,50 80x22 toggle"}},
    {"Searching static.ini",
     {"300,320 324x365 caption sysmenu sizing", "Static\tSelect folder with static.ini \t10,10 284x20",
      "SysListView32\t\t10,30 304x250 sunken columns Name,Type,Modified", "Edit\t\t10,300 304x20 sunken",
      "Button\tOK\t289,330 25x25"}},
    {"Searching missing objects",
     {"300,320 324x365 caption sysmenu sizing",
      "Static\tSelect mod maps file of type 'actors.static' to examine\t10,10 284x20",
      "SysListView32\t\t10,30 304x250 sunken columns Name,Type,Modified", "Edit\t\t10,300 304x20 sunken",
      "Button\tClose\t10,330 50x25", "Button\tOK\t289,330 25x25"}},
    {"List searching window", {"650,320 370x470 caption noclose", "ListBox\t\t10,20 350x430 sunken"}},
    {"Wait", {"400,340 180x40 caption noclose", "msctls_progress32\t\t10,10 160x20"}},
};

HWND CheckLayout(const std::string& title, int milliseconds = 5000) {
    HWND window = WaitForWindow(title, milliseconds);
    for (const auto& [name, layout] : Layouts)
        if (title == name) ExpectLines(Probe(window, ProbeLayout), layout, "layout of \"" + title + "\"");
    return window;
}

// Its standard output, the progress lines, goes through a file: Wine processes keep pipes open.
Strings RunCli(const std::string& arguments, bool withErrors = false) {
    std::string output = Work("cli-output.txt"), line = "\"" + CliPath + "\" " + arguments;
    SECURITY_ATTRIBUTES inherited = {sizeof inherited, nullptr, TRUE};
    STARTUPINFOA startup = {};
    startup.cb = sizeof startup;
    startup.dwFlags = STARTF_USESTDHANDLES;
    startup.hStdOutput =
        CreateFileA(output.c_str(), GENERIC_WRITE, FILE_SHARE_READ, &inherited, CREATE_ALWAYS, 0, nullptr);
    startup.hStdError = withErrors ? startup.hStdOutput : nullptr;
    PROCESS_INFORMATION cli = {};
    bool started = CreateProcessA(nullptr, line.data(), nullptr, nullptr, TRUE, 0, nullptr, WorkRoot.c_str(),
                                  &startup, &cli);
    CloseHandle(startup.hStdOutput);
    Require(started && WaitForSingleObject(cli.hProcess, 30000) == WAIT_OBJECT_0,
            "verrant-cli.exe " + arguments + " runs");
    CloseHandle(cli.hThread), CloseHandle(cli.hProcess);
    return SplitLines(FileBytes(output));
}

// Notepad opens the file and shows its bytes.
void ExpectNotepadShows(const std::string& fileName, const std::string& bytes) {
    auto shows = [&] {
        Windows notepads = TopWindows(fileName + " - ", "Notepad", true);
        return !notepads.empty() && WindowText(Control(notepads[0], "Edit")) == bytes;
    };
    Expect(Within(10000, shows), "Notepad shows the bytes of " + fileName);
}

// A command whose file and progress lines must be verrant-cli.exe's for the arguments: a report on the
// desktop, shown in Notepad, or the "demo" catalogue rewritten as the one of "demo-cli", then "Done".
struct CliCase {
    int menuId;
    std::string arguments, file, doneTitle;
};

void ExpectAsCli(const CliCase& command, HWND progress, const std::function<void()>& run = nullptr) {
    bool rewrite = !command.doneTitle.empty();
    std::string mine = (rewrite ? Work("demo\\" + CatalogueTail) : Desktop) + command.file;
    std::string theirs = (rewrite ? Work("demo-cli\\" + CatalogueTail) : Work("cli\\")) + command.file;
    if (!rewrite) DeleteFileA(mine.c_str()), DeleteFileA(theirs.c_str());
    Strings lines = RunCli(command.arguments + " --progress --report-dir " + Work("cli"));
    std::string expected = FileBytes(theirs);
    run ? run() : ChooseMenuItem(command.menuId);
    if (rewrite) ConfirmMessage(command.doneTitle, "Done", Main);
    if (!rewrite) ExpectNotepadShows(command.file, expected);
    Expect(FileBytes(mine) == expected, command.file + " is verrant-cli.exe's after " + command.arguments);
    if (!lines.empty())  // the lists write none
        ExpectLines(ListLines(Control(progress, "ListBox")), lines, "progress lines of " + command.arguments);
}

void ProgramFileResources() {
    DWORD size = GetFileVersionInfoSizeA(ProgramPath.c_str(), nullptr);
    std::string data(size, '\0');
    char* product = nullptr;
    UINT length = 0;
    Expect(GetFileVersionInfoA(ProgramPath.c_str(), 0, size, data.data()) &&
               VerQueryValueA(data.data(), "\\StringFileInfo\\040904B0\\ProductName",
                              reinterpret_cast<void**>(&product), &length) &&
               std::string(product) == "Verrant",
           "the version resource names the product Verrant");
    Expect(ExtractIconExA(ProgramPath.c_str(), -1, nullptr, nullptr, 0) >= 1, "verrant.exe carries an icon");
}

// Opens each folder of the path below the browser's current folder by Enter, checking the path box.
void BrowseDown(HWND chooser, std::string reached, const std::string& path) {
    for (std::size_t start = 0, slash; (slash = path.find('\\', start)) != std::string::npos;
         start = slash + 1) {
        reached += path.substr(start, slash - start + 1);
        OpenRow(chooser, path.substr(start, slash - start), ProbeEnterRow, reached);
    }
}

void FirstStartChooserAndMainWindow() {
    std::string catalogue = Work("demo\\" + CatalogueTail);
    Start("first");
    ConfirmMessage("Path to static.ini", "Select path to static.ini (..\\mods\\STD\\com\\..\\objects) first",
                   Main);
    HWND chooser = CheckLayout("Searching static.ini"), ok = Control(chooser, "Button");
    Strings rows = Probe(chooser, ProbeRows);
    Expect(std::count(rows.begin(), rows.end(), "Documents"), "the top level shows Documents");
    OpenRow(chooser, "C:\\", ProbeDoubleClickRow, "C:\\");  // a drive
    Screenshot("chooser");
    BrowseDown(chooser, "C:\\", Work("demo\\mods\\").substr(3));
    Click(ok);
    ConfirmMessage("Wrong folder selected", "There is no 'static.ini'", chooser);
    Expect(IsWindowVisible(chooser) && PathBoxShows(chooser, Work("demo\\mods\\")),
           "after a wrong folder the chooser stays open with its path");
    OpenRow(chooser, "..", ProbeEnterRow, Work("demo\\"));
    BrowseDown(chooser, Work("demo\\"), CatalogueTail);
    UseRow(chooser, "static.ini", ProbeSelectRow);
    Expect(PathBoxShows(chooser, catalogue + "static.ini"), "a selected file shows after its folder");
    Click(ok);
    ConfirmMessage("Path saved", "Path saved in verrant.ini");
    Expect(Gone(chooser), "the chooser closes once a folder is taken");
    Expect(FileBytes(Work("start\\first\\verrant.ini")) == catalogue, "verrant.ini holds the folder alone");

    CheckLayout("Verrant V.1.3");
    Strings menu = Probe(Main, ProbeMenu);
    Require(!menu.empty() && menu.back().size() > 5 && menu.back().rfind("  13 ", 0) == 0,
            "the last item is the credit, id 13");
    menu.back() = "  13 (credit)";
    // clang-format off
    ExpectLines(menu, {"File", "  1 Close",
                       "Search", "  2 .. missing objects", "  3 .. doubled objects", "  4 .. irregular entrys",
                       "  -", "  .. reference stuff", "    5 .. wrong sim references",
                       "    14 .. doubled used sims", "    15 .. empty references",
                       "Numeration", "  6 Renumber static.ini", "  7 Denumber static.ini",
                       "Create", "  8 .. objects list for FMB", "  9 .. objects list for FMB+",
                       "Path", "  11 Save path to static.ini/maps folder",
                       "  12 Clear path to static.ini/maps folder",
                       "?", "  13 (credit)"}, "menu");
    // clang-format on
    Screenshot("main-window");
    Close(true);
}

void CommandsAgainstCli() {
    std::string catalogue = Work("demo\\" + CatalogueTail), mine = " --catalogue " + catalogue;
    std::string theirs = " --catalogue " + Work("demo-cli\\" + CatalogueTail);
    Start("commands", catalogue);
    HWND toggle = Control(Main, "Button", 1);
    Click(toggle);
    HWND progress = CheckLayout("List searching window"), list = Control(progress, "ListBox");
    Expect(SendMessageA(toggle, BM_GETCHECK, 0, 0) == BST_CHECKED, "the toggle stays down");
    const CliCase commands[] = {
        {3, "doubled-objects" + mine, "Doubled_objects.txt", ""},
        {4, "irregular-entries" + mine, "Irregular_entrys.txt", ""},
        {15, "empty-references" + mine, "Empty_references.txt", ""},
        {5, "wrong-sim-references" + mine, "Missing_3do.txt", ""},
        {14, "doubled-used-sims" + mine, "Doubled_sims_or_meshes.txt", ""},
        {6, "renumber" + theirs, "static.ini", "Renumber static.ini"},
        {7, "denumber" + theirs, "static.ini", "Denumber static.ini"},
        {8, "fmb-list" + theirs, "Static_list_FMB.txt", ""},
        {9, "fmb-plus-list" + theirs, "Static_list_FMBplus.txt", ""},
    };
    for (const CliCase& command : commands) {
        ExpectAsCli(command, progress);
        if (command.menuId == 3) SetForegroundWindow(progress), Screenshot("progress-list");
    }
    // Denumbering's lines, which the lists leave, are more than the list shows at once.
    Expect(SendMessageA(list, LB_GETTOPINDEX, 0, 0) == 0 && (GetWindowLongA(list, GWL_STYLE) & WS_VSCROLL),
           "the progress list shows a scroll bar and does not scroll to new lines");
    // A list written last leaves the desktop current, where a decoy waits for a misdirected Notepad.
    WriteBytes(Desktop + "static.ini", "decoy\r\n");
    Click(Control(Main, "Button"));
    ExpectNotepadShows("static.ini", FileBytes(catalogue + "static.ini"));
    DeleteFileA((Desktop + "static.ini").c_str());
    Click(toggle);
    Expect(Gone(progress) && SendMessageA(toggle, BM_GETCHECK, 0, 0) == BST_UNCHECKED,
           "the toggle comes up and closes the progress list");
    Click(toggle);
    Expect(ListLines(Control(WaitForWindow("List searching window"), "ListBox")).empty(),
           "switched on again, the progress list is a new, empty one");
    Close();
}

void MissingObjectsWindow() {
    std::string catalogue = Work("demo\\" + CatalogueTail), map = Work("demo\\mods\\mapmods\\maps\\Coast\\");
    Start("map", catalogue);
    Click(Control(Main, "Button", 1));
    HWND progress = WaitForWindow("List searching window");
    ChooseMenuItem(2);
    HWND window = CheckLayout("Searching missing objects"), ok = Control(window, "Button", 1);
    ExpectLines(Probe(window, ProbeRows), {"..", "Coast"}, "the file list on the maps folder");
    UseRow(window, "Coast", ProbeDoubleClickRow);
    Expect(Within(5000,
                  [&] {
                      return Probe(window, ProbeRows) == Strings{"..", "actors.static"};
                  }),
           "a double click opens the map's folder");
    UseRow(window, "actors.static", ProbeSelectRow);
    map += "actors.static";
    Expect(PathBoxShows(window, "..." + map.substr(map.size() - 40)), "the status line cuts the pick to 43");
    Screenshot("missing-objects");
    ExpectAsCli({0, "missing-objects --map " + map, "Missing_objects.txt", ""}, progress, [&] { Click(ok); });
    Expect(IsWindowVisible(window), "the window stays open after a check");
    Click(Control(window, "Button", 0));
    Expect(Gone(window), "\"Close\" closes the window");
    Close();
}

void WaitWindowDuringLongRun() {
    DeleteFileA((Desktop + "Missing_3do.txt").c_str());
    Start("mesh-big", Work("mesh-big\\" + CatalogueTail));
    ChooseMenuItem(5);
    HWND wait = CheckLayout("Wait", 10000), bar = Control(wait, PROGRESS_CLASSA);
    Screenshot("wait-window");
    LRESULT low = SendMessageW(bar, PBM_GETRANGE, TRUE, 0), high = SendMessageW(bar, PBM_GETRANGE, FALSE, 0);
    LRESULT highest = 0;
    for (int waited = 0; IsWindowVisible(wait) && waited < 60000; waited += 20, Sleep(20))
        highest = std::max(highest, SendMessageW(bar, PBM_GETPOS, 0, 0));
    Expect(!IsWindowVisible(wait), "the Wait window closes at the end of the run");
    Expect(low == 0 && high == 35 && highest > 0 && highest <= 35,
           "the bar runs from 0 to 35 and moves: " + std::to_string(low) + ".." + std::to_string(high) +
               ", highest " + std::to_string(highest));
    Expect(Within(20000, [&] { return !TopWindows("Missing_3do.txt - ", "Notepad", true).empty(); }),
           "Notepad opens Missing_3do.txt");
    Expect(FileBytes(Desktop + "Missing_3do.txt").find("Gen19999") != std::string::npos,
           "Missing_3do.txt lists the generated entries");
    Close();
}

// While the program rewrites a catalogue, held there, verrant-cli.exe refuses to rewrite it too; the
// program's rewrite then ends whole.
void SecondRewriteRefuses() {
    std::string folder = Work("rewrite\\"), catalogue = folder + "static.ini",
                text = "[***]\r\nTitle Generated\r\n";
    for (int i = 0; i < 1000; ++i) text += "[buildings.House$Gen" + std::to_string(i) + "]\r\n";
    std::filesystem::create_directories(folder);
    WriteBytes(catalogue, text);
    Start("second-rewrite", folder);
    Click(Control(Main, "Button", 1));  // with the list on, the rewrite lets events through: it takes a while
    WaitForWindow("List searching window");
    ChooseMenuItem(6);
    Require(Within(20000, [&] { return std::filesystem::exists(catalogue + ".tmp"); }),
            "the program's rewrite makes static.ini.tmp");
    SuspendThread(App.hThread);
    Strings words = RunCli("renumber --catalogue " + folder, true);
    ResumeThread(App.hThread);
    Expect(words.size() == 2 && words[0] == "static.ini failure: Can't write static.ini.tmp",
           "verrant-cli.exe refuses a catalogue that is being rewritten: " + (words.empty() ? "" : words[0]));
    Within(60000, [&] { return !std::filesystem::exists(catalogue + ".tmp"); });
    ConfirmMessage("Renumber static.ini", "Done", Main);
    Expect(
        FileBytes(catalogue).rfind("[***]\r\nTitle Generated\r\n(0)\r\n[buildings.House$Gen0]\r\n", 0) == 0,
        "the program's rewrite is whole");
    Close();
}

}  // namespace

int main(int, char** argv) {
    ProgramPath = argv[1], ProbeLibrary = argv[2], WorkRoot = argv[3] + std::string("\\");
    ShotsFolder = argv[4] + std::string("\\"), CliPath = argv[5];
    SetEnvironmentVariableA(PROBE_FILE_VARIABLE, Work("probe-answer.txt").c_str());
    SetErrorMode(SEM_FAILCRITICALERRORS | SEM_NOOPENFILEERRORBOX);
    char desktop[MAX_PATH] = "";
    SHGetFolderPathA(nullptr, CSIDL_DESKTOPDIRECTORY, nullptr, 0, desktop);
    Desktop = desktop + std::string("\\");
    const std::pair<const char*, void (*)()> scenarios[] = {
        {"program file: version resource and icon", ProgramFileResources},
        {"first start: question, chooser, settings file; main window, menu", FirstStartChooserAndMainWindow},
        {"progress list; commands against verrant-cli.exe; Open static.ini", CommandsAgainstCli},
        {"missing objects window: layout, browser, report against verrant-cli.exe", MissingObjectsWindow},
        {"the Wait window during a long mesh search", WaitWindowDuringLongRun},
        {"a second rewrite refuses while the program rewrites the catalogue", SecondRewriteRefuses},
    };
    int passed = 0, failed = 0;
    for (auto [name, run] : scenarios) {
        Failures.clear();
        try {
            run();
        } catch (const std::exception& error) {
            Failures.push_back(std::string("stopped: ") + error.what());
        }
        Stop();
        ++(Failures.empty() ? passed : failed);
        std::printf("%s: %s\n", Failures.empty() ? "PASS" : "FAIL", name);
        for (const std::string& failure : Failures) std::printf("    %s\n", failure.c_str());
        std::fflush(stdout);
    }
    std::printf("%d passed, %d failed\n", passed, failed);
    return failed == 0 ? 0 : 1;
}
