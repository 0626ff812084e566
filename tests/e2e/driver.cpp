// The end-to-end driver: starts verrant.exe under Wine in fresh start folders, works its windows as a user
// would, checks what only real windows show and compares reports and rewritten catalogues with
// verrant-cli.exe's. Prints a line per scenario and ends with "N passed, M failed".
//   e2e_driver.exe PROGRAM PROBE_DLL SHOTS_FOLDER VERRANT_CLI DESKTOP_FOLDER
// The work folder holds the demo tree twice, "demo" and "demo-cli", and the generated "mesh-big".
#include "probe.h"

#include <windows.h>

#include <commctrl.h>

#include <algorithm>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <functional>
#include <map>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

namespace {

using Strings = std::vector<std::string>;

Strings Failures;  // of the running scenario
PROCESS_INFORMATION App = {};
HWND Main = nullptr;
std::string ProgramPath, ProbeLibrary, ShotsFolder, CliPath, Desktop;  // folders end in "\\"
const std::string WorkRoot = E2E_WORK_FOLDER, CatalogueTail = "mods\\std\\com\\maddox\\il2\\objects\\";
const std::string Catalogue = WorkRoot + "demo\\" + CatalogueTail;  // the program's

// A failed expectation is noted and the scenario goes on; a failed requirement ends the scenario.
void Expect(bool ok, const std::string& what) { ok ? void() : Failures.push_back(what); }

void Require(bool ok, const std::string& what) { ok ? void() : throw std::runtime_error(what); }

void ExpectLines(const Strings& actual, const Strings& expected, const std::string& what) {
    auto [seen, wanted] = std::mismatch(actual.begin(), actual.end(), expected.begin(), expected.end());
    if (seen != actual.end() || wanted != expected.end())
        Failures.push_back(what + ": line " + std::to_string(seen - actual.begin() + 1) + " is \"" +
                           (seen == actual.end() ? "(none)" : *seen) + "\", expected \"" +
                           (wanted == expected.end() ? "(none)" : *wanted) + "\"");
}

std::string Work(const std::string& relative) { return WorkRoot + relative; }

bool Within(int milliseconds, const std::function<bool()>& done) {
    for (int waited = 0; !done(); waited += 20, Sleep(20))
        if (waited >= milliseconds) return false;
    return true;
}

Strings FileLines(const std::string& path) {
    std::ifstream file(path);  // in text mode, which drops the "\r" of "\r\n"
    Strings lines;
    for (std::string line; std::getline(file, line);) lines.push_back(line);
    return lines;
}

std::string FileBytes(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    Require(file.is_open(), "can read " + path);
    return {std::istreambuf_iterator<char>(file), {}};
}

// Another process's text comes back as UTF-16 under Wine whatever the call; the program's is ASCII.
std::string WindowText(HWND window) {
    static wchar_t text[1 << 20];
    DWORD_PTR length = 0;
    SendMessageTimeoutW(window, WM_GETTEXT, 1 << 20, reinterpret_cast<LPARAM>(text), SMTO_ABORTIFHUNG, 2000,
                        &length);
    return std::string(text, text + length);
}

// Visible top-level windows of the program by a part of the title and the class: all are its main thread's.
std::vector<HWND> TopWindows(const std::string& titlePart, const char* windowClass = nullptr) {
    std::vector<HWND> found;
    for (HWND window = nullptr; (window = FindWindowExA(nullptr, window, windowClass, nullptr));)
        if (GetWindowThreadProcessId(window, nullptr) == App.dwThreadId && IsWindowVisible(window) &&
            WindowText(window).find(titlePart) != std::string::npos)
            found.push_back(window);
    return found;
}

HWND Notepad(const std::string& file) { return FindWindowA("Notepad", (file + " - Notepad").c_str()); }

HWND WaitForWindow(const std::string& title, int ms = 10000, const char* windowClass = nullptr) {
    std::vector<HWND> found;
    Require(Within(ms, [&] { return !(found = TopWindows(title, windowClass)).empty(); }), title + " opens");
    return found[0];
}

bool Gone(HWND window) {
    return Within(5000, [&] { return !IsWindowVisible(window); });  // false for a window that is no more
}

HWND Control(HWND window, const char* windowClass, int index = 0) {
    HWND before = index ? Control(window, windowClass, index - 1) : nullptr;
    return FindWindowExA(window, before, windowClass, nullptr);
}

void Click(HWND button) { PostMessageA(button, BM_CLICK, 0, 0); }

void ChooseMenuItem(int id) {
    SetForegroundWindow(Main);  // as a click into its menu bar would
    PostMessageA(Main, WM_COMMAND, static_cast<WPARAM>(id), 0);
}

// The test script watches for NAME.request files and takes a screenshot for each.
void Screenshot(const std::string& name) {
    Sleep(300);  // let every window finish painting
    std::string request = ShotsFolder + name + ".request";
    std::ofstream(request) << name;
    Within(15000, [&] { return !std::filesystem::exists(request); });
}

PROCESS_INFORMATION Launch(std::string line, const char* folder) {
    STARTUPINFOA startup = {.cb = sizeof startup};
    PROCESS_INFORMATION process = {};
    Require(CreateProcessA(nullptr, line.data(), nullptr, nullptr, 0, 0, nullptr, folder, &startup, &process),
            line + " starts");
    return process;
}

// Starts verrant.exe in a start folder of its own, with a settings file if given, and hooks in the probe
// (the hook ends with the program's thread).
void Start(const std::string& name, const std::string& settings = "") {
    std::string folder = Work("start\\" + name + "\\");
    std::filesystem::create_directories(folder);
    if (!settings.empty()) std::ofstream(folder + "verrant.ini", std::ios::binary) << settings;
    App = Launch("\"" + ProgramPath + "\"", folder.c_str());
    Main = WaitForWindow("Verrant V.1.3");
    HMODULE library = LoadLibraryA(ProbeLibrary.c_str());
    auto hook = reinterpret_cast<HOOKPROC>(reinterpret_cast<void*>(GetProcAddress(library, "ProbeHook")));
    Require(SetWindowsHookExA(WH_GETMESSAGE, hook, library, App.dwThreadId), "the probe hooks in");
}

void Close(bool byCloseBox = false) {
    byCloseBox ? (void)PostMessageA(Main, WM_SYSCOMMAND, SC_CLOSE, 0) : ChooseMenuItem(1);
    DWORD code = 99;
    Expect(WaitForSingleObject(App.hProcess, 5000) == WAIT_OBJECT_0 &&
               GetExitCodeProcess(App.hProcess, &code) && code == 0,
           std::string(byCloseBox ? "the close box" : "\"Close\"") + " ends the program with exit code 0");
}

Strings Probe(HWND window, ProbeRequest request, int row = 0) {
    static const UINT message = RegisterWindowMessageA(PROBE_MESSAGE_NAME);
    DeleteFileA(PROBE_ANSWER_FILE);
    PostMessageA(window, message, request, row);
    Require(Within(5000, [&] { return std::filesystem::exists(PROBE_ANSWER_FILE); }), "the probe answers");
    return FileLines(PROBE_ANSWER_FILE);
}

// The chooser's path box, or the status line of the missing objects window.
bool PathBoxShows(HWND window, const std::string& text) {
    return Within(5000, [&] { return WindowText(Control(window, "Edit")) == text; });
}

// Selects or opens a row of a window's file browser by its name; opening one reaches the path given.
void UseRow(HWND window, const std::string& name, ProbeRequest how, const std::string& reached = "") {
    Strings rows = Probe(window, ProbeRows);
    auto row = std::find(rows.begin(), rows.end(), name);
    Require(row != rows.end(), "the browser shows \"" + name + "\"");
    Probe(window, how, static_cast<int>(row - rows.begin()));
    Require(reached.empty() || PathBoxShows(window, reached), "opening \"" + name + "\" shows " + reached);
}

// Opens each folder of the path below the browser's current folder by Enter, checking the path box.
void BrowseDown(HWND chooser, std::string reached, const std::string& path) {
    std::istringstream folders(path);
    for (std::string folder; std::getline(folders, folder, '\\');)
        UseRow(chooser, folder, ProbeEnterRow, reached += folder + "\\");
}

// A message box: title, text, no icon, its owner if given (a box shown while no window of the program is
// in front has none), every other window of the program disabled while it shows and enabled after OK.
void ConfirmMessage(const std::string& title, const std::string& text, HWND owner = nullptr) {
    HWND box = WaitForWindow(title, 10000, "#32770");
    Sleep(50);  // let it finish drawing before it is read
    std::string seen = WindowText(box) + ": " + WindowText(GetDlgItem(box, 0xFFFF));
    Expect(seen == title + ": " + text, "message box \"" + seen + "\", expected " + title + ": " + text);
    Expect(!owner || GetWindow(box, GW_OWNER) == owner, title + " is owned by " + WindowText(owner));
    // The icon static is there even with no icon; what counts is whether it holds one.
    for (HWND child = GetWindow(box, GW_CHILD); child; child = GetWindow(child, GW_HWNDNEXT))
        Expect(SendMessageW(child, STM_GETICON, 0, 0) == 0, title + " has no icon");
    std::vector<HWND> others = TopWindows("");
    for (HWND window : others)
        Expect(window == box || !IsWindowEnabled(window), WindowText(window) + " is disabled under " + title);
    Click(GetDlgItem(box, IDOK));
    Require(Gone(box), title + " goes away with OK");
    for (HWND window : others)
        Expect(Within(2000, [&] { return !IsWindow(window) || IsWindowEnabled(window); }),
               WindowText(window) + " is enabled again after " + title);
}

// Each window's place, client size and frame; its controls in creation order: class, text, place, traits;
// its menu by depth. A caption that does not fit, or the bold system font, shows in the probe's answer.
const std::map<std::string, Strings> Layouts = {
    {"Verrant V.1.3",
     {"250,250 270x110 caption sysmenu sizing", "Button\tOpen static.ini\t5,15 80x22",
      "Button\tList searching\t5,50 80x22 toggle",
      // clang-format off
      "File", "  1 Close", "Search", "  2 .. missing objects", "  3 .. doubled objects",
      "  4 .. irregular entrys", "  -", "  .. reference stuff", "    5 .. wrong sim references",
      "    14 .. doubled used sims", "    15 .. empty references", "Numeration", "  6 Renumber static.ini",
      "  7 Denumber static.ini", "Create", "  8 .. objects list for FMB", "  9 .. objects list for FMB+",
      "Path", "  11 Save path to static.ini/maps folder", "  12 Clear path to static.ini/maps folder",
      "?", "  13 Verrant V.1.3 - keeps your static.ini tidy"}},
    // clang-format on
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

HWND CheckLayout(const std::string& title) {
    HWND window = WaitForWindow(title);
    ExpectLines(Probe(window, ProbeLayout), Layouts.at(title), "layout of \"" + title + "\"");
    return window;
}

void ExpectNotepadShows(const std::string& file, const std::string& bytes) {
    auto shows = [&] { return Notepad(file) && WindowText(Control(Notepad(file), "Edit")) == bytes; };
    Expect(Within(10000, shows), "Notepad shows the bytes of " + file);
}

// A command whose file and progress lines must be verrant-cli.exe's: a desktop report shown in Notepad, or
// "demo"'s catalogue rewritten as "demo-cli"'s, then "Done". The lines come by file: Wine keeps pipes open.
struct CliCase {
    int menuId;
    std::string arguments, file, doneTitle = "";
};

void ExpectAsCli(const CliCase& command, HWND progress, const std::function<void()>& run = nullptr) {
    bool rewrite = !command.doneTitle.empty();
    std::string mine = (rewrite ? Catalogue : Desktop) + command.file;
    std::string theirs = (rewrite ? Work("demo-cli\\" + CatalogueTail) : Work("cli\\")) + command.file;
    std::string cli = "\"" + CliPath + "\" " + command.arguments + " --progress --report-dir cli";
    PROCESS_INFORMATION process = Launch("cmd /c \"" + cli + " >cli-output.txt\"", WorkRoot.c_str());
    Require(WaitForSingleObject(process.hProcess, 30000) == WAIT_OBJECT_0, cli + " ends");
    CloseHandle(process.hThread), CloseHandle(process.hProcess);
    Strings lines = FileLines(Work("cli-output.txt"));
    std::string expected = FileBytes(theirs);
    run ? run() : ChooseMenuItem(command.menuId);
    rewrite ? ConfirmMessage(command.doneTitle, "Done", Main) : ExpectNotepadShows(command.file, expected);
    Expect(FileBytes(mine) == expected, command.file + " is verrant-cli.exe's after " + command.arguments);
    if (!lines.empty())  // the lists write none
        ExpectLines(Probe(progress, ProbeRows), lines, "progress lines of " + command.arguments);
}

void ProgramFileResources() {
    std::string data(GetFileVersionInfoSizeA(ProgramPath.c_str(), nullptr), '\0');
    void* product = nullptr;
    UINT length = 0;
    GetFileVersionInfoA(ProgramPath.c_str(), 0, data.size(), data.data());
    VerQueryValueA(data.data(), "\\StringFileInfo\\040904B0\\ProductName", &product, &length);
    Expect(product && static_cast<char*>(product) == std::string("Verrant"), "the product name is Verrant");
    Expect(ExtractIconExA(ProgramPath.c_str(), -1, nullptr, nullptr, 0) >= 1, "verrant.exe carries an icon");
}

void FirstStartChooserAndMainWindow() {
    Start("first");
    ConfirmMessage("Path to static.ini", "Select path to static.ini (..\\mods\\STD\\com\\..\\objects) first",
                   Main);
    HWND chooser = CheckLayout("Searching static.ini"), ok = Control(chooser, "Button");
    Expect(std::ranges::count(Probe(chooser, ProbeRows), "Documents"), "the top level shows Documents");
    UseRow(chooser, "C:\\", ProbeDoubleClickRow, "C:\\");  // a drive
    Screenshot("chooser");
    BrowseDown(chooser, "C:\\", Work("demo\\mods\\").substr(3));
    Click(ok);
    ConfirmMessage("Wrong folder selected", "There is no 'static.ini'", chooser);
    Expect(IsWindowVisible(chooser) && PathBoxShows(chooser, Work("demo\\mods\\")), "the chooser stays open");
    UseRow(chooser, "..", ProbeEnterRow, Work("demo\\"));
    BrowseDown(chooser, Work("demo\\"), CatalogueTail);
    UseRow(chooser, "static.ini", ProbeSelectRow, Catalogue + "static.ini");  // a file shows after its folder
    Click(ok);
    ConfirmMessage("Path saved", "Path saved in verrant.ini");
    Expect(Gone(chooser), "the chooser closes once a folder is taken");
    Expect(FileBytes(Work("start\\first\\verrant.ini")) == Catalogue, "verrant.ini holds the folder alone");
    CheckLayout("Verrant V.1.3");
    Screenshot("main-window");
    Close(true);
}

void CommandsAgainstCli() {
    std::string theirs = " --catalogue " + Work("demo-cli\\" + CatalogueTail);
    Start("commands", Catalogue);
    HWND toggle = Control(Main, "Button", 1);
    Click(toggle);
    HWND progress = CheckLayout("List searching window"), list = Control(progress, "ListBox");
    Expect(SendMessageA(toggle, BM_GETCHECK, 0, 0) == BST_CHECKED, "the toggle stays down");
    ExpectAsCli({3, "doubled-objects --catalogue " + Catalogue, "Doubled_objects.txt"}, progress);
    SetForegroundWindow(progress);
    Screenshot("progress-list");
    ExpectAsCli({4, "irregular-entries --catalogue " + Catalogue, "Irregular_entrys.txt"}, progress);
    ExpectAsCli({15, "empty-references --catalogue " + Catalogue, "Empty_references.txt"}, progress);
    ExpectAsCli({5, "wrong-sim-references --catalogue " + Catalogue, "Missing_3do.txt"}, progress);
    ExpectAsCli({14, "doubled-used-sims --catalogue " + Catalogue, "Doubled_sims_or_meshes.txt"}, progress);
    ExpectAsCli({6, "renumber" + theirs, "static.ini", "Renumber static.ini"}, progress);
    ExpectAsCli({7, "denumber" + theirs, "static.ini", "Denumber static.ini"}, progress);
    ExpectAsCli({8, "fmb-list" + theirs, "Static_list_FMB.txt"}, progress);
    ExpectAsCli({9, "fmb-plus-list" + theirs, "Static_list_FMBplus.txt"}, progress);
    // Denumbering's lines, which the lists leave, are more than the list shows at once.
    Expect(SendMessageA(list, LB_GETTOPINDEX, 0, 0) == 0 && (GetWindowLongA(list, GWL_STYLE) & WS_VSCROLL),
           "the progress list shows a scroll bar and does not scroll to new lines");
    // A list written last leaves the desktop current, where a decoy waits for a misdirected Notepad.
    std::ofstream(Desktop + "static.ini") << "decoy\n";
    Click(Control(Main, "Button"));
    ExpectNotepadShows("static.ini", FileBytes(Catalogue + "static.ini"));
    Click(toggle);
    Expect(Gone(progress) && SendMessageA(toggle, BM_GETCHECK, 0, 0) == BST_UNCHECKED, "the toggle comes up");
    Click(toggle);
    Expect(Probe(WaitForWindow("List searching window"), ProbeRows).empty(), "a new progress list is empty");
    Close();
}

void MissingObjectsWindow() {
    std::string map = Work("demo\\mods\\mapmods\\maps\\Coast\\actors.static");
    Start("map", Catalogue);
    Click(Control(Main, "Button", 1));
    HWND progress = WaitForWindow("List searching window");
    ChooseMenuItem(2);
    HWND window = CheckLayout("Searching missing objects"), ok = Control(window, "Button", 1);
    ExpectLines(Probe(window, ProbeRows), {"..", "Coast"}, "the file list on the maps folder");
    UseRow(window, "Coast", ProbeDoubleClickRow);
    auto opened = [&] { return Probe(window, ProbeRows) == Strings{"..", "actors.static"}; };
    Expect(Within(5000, opened), "a double click opens the map's folder");
    UseRow(window, "actors.static", ProbeSelectRow, "..." + map.substr(map.size() - 40));  // cut to 43
    Screenshot("missing-objects");
    ExpectAsCli({0, "missing-objects --map " + map, "Missing_objects.txt"}, progress, [&] { Click(ok); });
    Expect(IsWindowVisible(window), "the window stays open after a check");
    Click(Control(window, "Button", 0));
    Expect(Gone(window), "\"Close\" closes the window");
    Close();
}

void WaitWindowDuringLongRun() {
    Start("mesh-big", Work("mesh-big\\" + CatalogueTail));
    ChooseMenuItem(5);
    HWND wait = CheckLayout("Wait"), bar = Control(wait, PROGRESS_CLASSA);
    Screenshot("wait-window");
    Expect(SendMessageW(bar, PBM_GETRANGE, TRUE, 0) == 0 && SendMessageW(bar, PBM_GETRANGE, FALSE, 0) == 35,
           "the bar runs from 0 to 35");
    LRESULT highest = 0;
    for (int waited = 0; IsWindowVisible(wait) && waited < 60000; waited += 20, Sleep(20))
        highest = std::max(highest, SendMessageW(bar, PBM_GETPOS, 0, 0));
    Expect(!IsWindowVisible(wait), "the Wait window closes at the end of the run");
    Expect(highest > 0 && highest <= 35, "the bar moves within its range: " + std::to_string(highest));
    Expect(Within(20000, [&] { return Notepad("Missing_3do.txt"); }), "Notepad opens Missing_3do.txt");
    Expect(FileBytes(Desktop + "Missing_3do.txt").find("Gen19999") != std::string::npos, "it lists them all");
    Close();
}

// While the program rewrites a catalogue, held there, verrant-cli.exe refuses to rewrite it too; the
// program's rewrite then ends whole.
void SecondRewriteRefuses() {
    std::string folder = Work("rewrite\\"), catalogue = folder + "static.ini", text = "[***]\r\nTitle Generated\r\n";
    for (int i = 0; i < 1000; ++i) text += "[buildings.House$Gen" + std::to_string(i) + "]\r\n";
    std::filesystem::create_directories(folder);
    std::ofstream(catalogue, std::ios::binary) << text;
    Start("second-rewrite", folder);
    Click(Control(Main, "Button", 1));  // with the list on, the rewrite lets events through: it takes a while
    WaitForWindow("List searching window");
    ChooseMenuItem(6);
    Require(Within(20000, [&] { return std::filesystem::exists(catalogue + ".tmp"); }),
            "the program's rewrite makes static.ini.tmp");
    SuspendThread(App.hThread);
    std::string cli = "\"" + CliPath + "\" renumber --catalogue " + folder;
    PROCESS_INFORMATION process = Launch("cmd /c \"" + cli + " >cli-output.txt 2>&1\"", WorkRoot.c_str());
    bool ended = WaitForSingleObject(process.hProcess, 30000) == WAIT_OBJECT_0;
    CloseHandle(process.hThread), CloseHandle(process.hProcess);
    ResumeThread(App.hThread);
    Strings words = FileLines(Work("cli-output.txt"));
    Expect(ended && !words.empty() && words[0] == "static.ini failure: Can't write static.ini.tmp",
           "verrant-cli.exe refuses a catalogue that is being rewritten: " + (words.empty() ? "" : words[0]));
    Within(60000, [&] { return !std::filesystem::exists(catalogue + ".tmp"); });
    ConfirmMessage("Renumber static.ini", "Done", Main);
    Expect(FileBytes(catalogue).rfind("[***]\r\nTitle Generated\r\n(0)\r\n[buildings.House$Gen0]\r\n", 0) == 0,
           "the program's rewrite is whole");
    Close();
}

int Passed = 0, Failed = 0;

// Runs a scenario, then ends what it left running: any Notepad, and the program.
void Run(const char* name, void (*scenario)()) {
    Failures.clear();
    try {
        scenario();
    } catch (const std::exception& error) {
        Failures.push_back(std::string("stopped: ") + error.what());
    }
    for (HWND notepad = nullptr; (notepad = FindWindowExA(nullptr, notepad, "Notepad", nullptr));)
        PostMessageA(notepad, WM_CLOSE, 0, 0);
    TerminateProcess(App.hProcess, 99), WaitForSingleObject(App.hProcess, 5000);  // harmless once ended
    CloseHandle(App.hThread), CloseHandle(App.hProcess);
    App = {};
    ++(Failures.empty() ? Passed : Failed);
    std::printf("%s: %s\n", Failures.empty() ? "PASS" : "FAIL", name);
    for (const std::string& failure : Failures) std::printf("    %s\n", failure.c_str());
    std::fflush(stdout);
}

}  // namespace

int main(int, char** argv) {
    ProgramPath = argv[1], ProbeLibrary = argv[2], ShotsFolder = argv[3] + std::string("\\");
    CliPath = argv[4], Desktop = argv[5] + std::string("\\");
    SetErrorMode(SEM_FAILCRITICALERRORS | SEM_NOOPENFILEERRORBOX);
    Run("program file: version resource and icon", ProgramFileResources);
    Run("first start: question, chooser, settings file; main window, menu", FirstStartChooserAndMainWindow);
    Run("progress list; commands against verrant-cli.exe; Open static.ini", CommandsAgainstCli);
    Run("missing objects window: layout, browser, report against verrant-cli.exe", MissingObjectsWindow);
    Run("the Wait window during a long mesh search", WaitWindowDuringLongRun);
    Run("a second rewrite refuses while the program rewrites the catalogue", SecondRewriteRefuses);
    std::printf("%d passed, %d failed\n", Passed, Failed);
    return Failed == 0 ? 0 : 1;
}
