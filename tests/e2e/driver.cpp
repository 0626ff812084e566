// The end-to-end driver: starts verrant.exe under Wine in fresh start folders and works it through
// its windows as a user would. Prints one line per scenario and ends with "N passed, M failed".
//   e2e_driver.exe PROGRAM PROBE_DLL WORK_FOLDER [SHOTS_FOLDER]
// The environment values VERRANT_E2E_DEMO_TREE and VERRANT_E2E_CLI name the demo tree and
// verrant-cli.exe, which the scenarios of the map check, the rewriting and the lists need.
#include "driver_support.h"

#include <algorithm>
#include <cstdio>
#include <functional>

#include <commctrl.h>

namespace {

const std::string CatalogueTail = "mods\\std\\com\\maddox\\il2\\objects\\";
const std::string Ruler(67, '*');

// Set by the test script: the demo tree to copy, and verrant-cli.exe as the reference.
#define DEMO_TREE_VARIABLE "VERRANT_E2E_DEMO_TREE"
#define CLI_VARIABLE "VERRANT_E2E_CLI"

std::string Work(const std::string& relative) { return Settings.workRoot + relative; }
std::string TreeCatalogue() { return Work("tree\\" + CatalogueTail); }
std::string CleanCatalogue() { return Work("clean\\" + CatalogueTail); }

std::string Headers(const Strings& names) {
    std::string text = "[***]\r\nTitle Houses\r\n";
    for (const std::string& name : names)
        text += "[buildings.House$" + name + "]\r\nMesh 3do/Buildings/x/live.sim\r\n";
    return text;
}

// Forty objects, two of them doubled: more lines than the progress list shows at once.
Strings TreeNames() {
    Strings names;
    for (int i = 0; i < 40; ++i) names.push_back("Object" + std::to_string(i));
    names[5] = names[17] = "Dup1";
    names[20] = names[33] = "Dup2";
    return names;
}

void MakeFixtures() {
    MakeFolders(TreeCatalogue());
    WriteBytes(TreeCatalogue() + "static.ini", Headers(TreeNames()));
    MakeFolders(CleanCatalogue());
    WriteBytes(CleanCatalogue() + "static.ini", Headers({"A", "a", "B"}));
    MakeFolders(Work("empty"));
    MakeFolders(Work("gone"));
}

// A start folder of its own for each program run, optionally with a settings file.
std::string FreshStartFolder(const std::string& name, const std::string* settings = nullptr) {
    std::string folder = Work("start\\" + name + "\\");
    MakeFolders(folder);
    DeleteFileA((folder + "verrant.ini").c_str());
    if (settings) WriteBytes(folder + "verrant.ini", *settings);
    return folder;
}

std::vector<double> StartTimes;

Program Start(const std::string& startFolder) {
    Program program = StartProgram(startFolder);
    StartTimes.push_back(program.startMilliseconds);
    return program;
}

void ExpectPlace(HWND control, int left, int top, int width, int height, const std::string& what) {
    RECT place = ChildPlace(control);
    Expect(place.left == left && place.top == top && place.right == width && place.bottom == height,
           what + " at " + std::to_string(place.left) + "," + std::to_string(place.top) + " size " +
               std::to_string(place.right) + "x" + std::to_string(place.bottom));
}

void ExpectFrame(HWND window, int left, int top, int clientWidth, int clientHeight, const std::string& what) {
    RECT actual, expected = ExpectedFrame(window, left, top, clientWidth, clientHeight);
    GetWindowRect(window, &actual);
    Expect(EqualRect(&actual, &expected) != FALSE,
           what + " frame at " + std::to_string(actual.left) + "," + std::to_string(actual.top) + " size " +
               std::to_string(actual.right - actual.left) + "x" + std::to_string(actual.bottom - actual.top));
}

void ExpectStyle(HWND window, bool systemMenu, bool sizingBorder, const std::string& what) {
    LONG style = GetWindowLongA(window, GWL_STYLE);
    Expect((style & WS_CAPTION) == WS_CAPTION, what + " has a title bar");
    Expect(((style & WS_SYSMENU) != 0) == systemMenu,
           what + (systemMenu ? " has" : " has no") + " system menu");
    Expect(((style & WS_THICKFRAME) != 0) == sizingBorder,
           what + (sizingBorder ? " has" : " has no") + " sizing border");
    Expect((style & (WS_MINIMIZEBOX | WS_MAXIMIZEBOX)) == 0, what + " has no minimize or maximize box");
}

// Every caption must fit its control in the font the control uses, and no control may use the
// bold system font.
void ExpectCaptionsFit(Program& program, HWND window, const std::string& what) {
    for (const std::string& line : SplitLines(Probe(program, window, ProbeCaptions))) {
        Strings fields = SplitTabs(line);
        if (fields.size() < 4 || fields[0].empty()) continue;
        Expect(fields[3] != "(system font)" && fields[3] != "System",
               what + ": \"" + fields[0] + "\" has a normal font");
        Expect(std::stoi(fields[1]) + 4 <= std::stoi(fields[2]),  // two pixels of border on each side
               what + ": \"" + fields[0] + "\" needs " + fields[1] + " of " + fields[2] + " pixels");
    }
}

HWND Control(HWND window, const char* windowClass, int index = 0) {
    HWND child = nullptr;
    for (int i = 0; i <= index; ++i) child = FindWindowExA(window, child, windowClass, nullptr);
    return child;
}

HWND ProgressList(HWND window) { return Control(window, "ListBox"); }

void AnswerStartQuestion(const Program& program) {
    ConfirmMessage(program, "Path to static.ini",
                   "Select path to static.ini (..\\mods\\STD\\com\\..\\objects) first");
}

HWND ChooserWindow(const Program& program) {
    HWND chooser = WaitForWindow(program, "Searching static.ini");
    Require(chooser != nullptr, "the chooser \"Searching static.ini\" opens");
    return chooser;
}

// The chooser's path box, or the status line of the missing objects window.
std::string PathBoxText(HWND window) { return WindowText(Control(window, "Edit")); }

bool WaitForPathBox(HWND window, const std::string& text) {
    for (int waited = 0; PathBoxText(window) != text; waited += 20) {
        if (waited > 5000) return false;
        Pause(20);
    }
    return true;
}

// Walks the chooser's browser from the top level down to a folder, opening each step by Enter
// (or the first by a double click), and checks the path box at every step.
void BrowseTo(Program& program, HWND chooser, const std::string& folder) {
    std::string reached;
    std::size_t start = 0;
    bool first = true;
    while (start < folder.size()) {
        std::size_t slash = folder.find('\\', start);
        std::string name = folder.substr(start, slash - start);
        std::string row = first ? name + "\\" : name;
        reached += name + "\\";
        OpenBrowserRow(program, chooser, row, first);
        Require(WaitForPathBox(chooser, reached), "the path box shows " + reached + " after opening " + row +
                                                      " (it shows \"" + PathBoxText(chooser) + "\")");
        start = slash + 1;
        first = false;
    }
}

long Finish(Program& program) {
    long code = WaitForExit(program, 5000);
    StopProgram(program);
    return code;
}

//--- scenarios

// First start without a settings file: the question, the chooser, and closing it.
void FirstStartAndMainWindow() {
    Program program = Start(FreshStartFolder("first"));
    MessageBoxSeen question = WaitForMessageBox(program);
    Expect(IsWindowVisible(program.main) != FALSE, "the main window is visible during the start question");
    ExpectText(question.title, "Path to static.ini", "start question title");
    ExpectText(question.text, "Select path to static.ini (..\\mods\\STD\\com\\..\\objects) first",
               "start question");
    Expect(!question.hasIcon, "the start question has no icon");
    Expect(question.owner == program.main, "the start question is owned by the main window");
    DismissMessageBox(question);

    HWND chooser = ChooserWindow(program);
    ExpectFrame(chooser, 300, 320, 324, 365, "chooser");
    ExpectStyle(chooser, true, true, "chooser");
    HWND label = Control(chooser, "Static");
    ExpectText(WindowText(label), "Select folder with static.ini ", "chooser label");
    ExpectPlace(Control(chooser, "SysListView32"), 10, 30, 304, 250, "chooser browser");
    HWND pathBox = Control(chooser, "Edit");
    ExpectPlace(pathBox, 10, 300, 304, 20, "chooser path box");
    Expect((GetWindowLongA(pathBox, GWL_EXSTYLE) & WS_EX_CLIENTEDGE) != 0, "the path box is sunken");
    ExpectText(WindowText(pathBox), "", "chooser path box at first");
    HWND ok = Control(chooser, "Button");
    ExpectText(WindowText(ok), "OK", "chooser button");
    ExpectPlace(ok, 289, 330, 25, 25, "chooser OK");
    Strings rows = SplitLines(Probe(program, chooser, ProbeRows));
    ExpectText(rows.empty() ? "" : rows[0], "columns\tName\tType\tModified", "browser columns");
    Strings names = BrowserRowNames(program, chooser);
    Expect(std::find(names.begin(), names.end(), "C:\\") != names.end(), "the top level shows drive C:");
    Expect(std::find(names.begin(), names.end(), "Documents") != names.end(),
           "the top level shows Documents");
    ExpectCaptionsFit(program, chooser, "chooser");
    Screenshot("chooser-top-level");
    OpenBrowserRow(program, chooser, "C:\\", false);
    WaitForPathBox(chooser, "C:\\");
    Screenshot("chooser");
    PressCloseBox(chooser);
    Expect(WaitUntilGone(chooser), "the close box closes the chooser");
    Pause(300);
    Expect(!MessageBoxShown(program), "closing the chooser shows no message");
    Expect(!FileExists(Work("start\\first\\verrant.ini")), "closing the chooser saves nothing");

    ExpectFrame(program.main, 250, 250, 270, 110, "main window");
    ExpectStyle(program.main, true, true, "main window");
    RECT client = ClientSize(program.main);
    Strings menu = SplitLines(Probe(program, program.main, ProbeMenu));
    Require(!menu.empty() && menu[0].rfind("bar\t", 0) == 0, "the main window has a menu bar");
    int barHeight = std::stoi(SplitTabs(menu[0]).at(1));
    Expect(client.right == 270, "main client width 270, is " + std::to_string(client.right));
    Expect(barHeight > 0 && client.bottom < 110 && client.bottom >= 110 - 2 * barHeight,
           "the menu bar (" + std::to_string(barHeight) + ") takes its height out of 110: client height " +
               std::to_string(client.bottom));
    HWND open = Control(program.main, "Button", 0), toggle = Control(program.main, "Button", 1);
    ExpectText(WindowText(open), "Open static.ini", "first button");
    ExpectPlace(open, 5, 15, 80, 22, "\"Open static.ini\"");
    ExpectText(WindowText(toggle), "List searching", "second button");
    ExpectPlace(toggle, 5, 50, 80, 22, "\"List searching\"");
    Expect((GetWindowLongA(toggle, GWL_STYLE) & (BS_PUSHLIKE | 0xF)) == (BS_PUSHLIKE | BS_AUTOCHECKBOX),
           "\"List searching\" is a push-like toggle");
    ExpectCaptionsFit(program, program.main, "main window");

    std::vector<std::string> items(menu.begin() + 1, menu.end());
    Require(!items.empty(), "the menu has items");
    Strings credit = SplitTabs(items.back());
    Expect(credit.size() == 5 && credit[0] == "1" && credit[1] == "item" && credit[2] == "13" &&
               !credit[4].empty() && credit[4].find('\t') == std::string::npos,
           "the last item is the credit item, id 13 under \"?\": " + items.back());
    items.back() = "1\titem\t13\tenabled\t(credit)";
    for (std::string& item : items)
        if (item.rfind("1\tseparator", 0) == 0) item = "1\tseparator";
    ExpectLines(items,
                {"0\tsub\t0\tenabled\tFile",
                 "1\titem\t1\tenabled\tClose",
                 "0\tsub\t0\tenabled\tSearch",
                 "1\titem\t2\tenabled\t.. missing objects",
                 "1\titem\t3\tenabled\t.. doubled objects",
                 "1\titem\t4\tenabled\t.. irregular entrys",
                 "1\tseparator",
                 "1\tsub\t0\tenabled\t.. reference stuff",
                 "2\titem\t5\tenabled\t.. wrong sim references",
                 "2\titem\t14\tenabled\t.. doubled used sims",
                 "2\titem\t15\tenabled\t.. empty references",
                 "0\tsub\t0\tenabled\tNumeration",
                 "1\titem\t6\tenabled\tRenumber static.ini",
                 "1\titem\t7\tenabled\tDenumber static.ini",
                 "0\tsub\t0\tenabled\tCreate",
                 "1\titem\t8\tenabled\t.. objects list for FMB",
                 "1\titem\t9\tenabled\t.. objects list for FMB+",
                 "0\tsub\t0\tenabled\tPath",
                 "1\titem\t11\tenabled\tSave path to static.ini/maps folder",
                 "1\titem\t12\tenabled\tClear path to static.ini/maps folder",
                 "0\tsub\t0\tenabled\t?",
                 "1\titem\t13\tenabled\t(credit)"},
                "menu table");
    Screenshot("main-window");

    ChooseMenuItem(program, 1);
    Expect(Finish(program) == 0, "\"Close\" ends the program with exit code 0");
}

// Choosing a folder without static.ini, then one with it: the settings file holds the path alone.
void ChooseFolderAndSave() {
    Program program = Start(FreshStartFolder("choose"));
    AnswerStartQuestion(program);
    HWND chooser = ChooserWindow(program);
    BrowseTo(program, chooser, Work("empty\\"));
    Strings names = BrowserRowNames(program, chooser);
    ExpectLines(names, {".."}, "an empty folder shows the parent entry alone");
    ClickButton(Control(chooser, "Button"));
    ConfirmMessage(program, "Wrong folder selected", "There is no 'static.ini'");
    Expect(IsWindowVisible(chooser) != FALSE, "the chooser stays open after a wrong folder");
    ExpectText(PathBoxText(chooser), Work("empty\\"), "the path box keeps its text");

    OpenBrowserRow(program, chooser, "..", false);
    Require(WaitForPathBox(chooser, Work("")), "the parent entry leads back to " + Work(""));
    std::string rest = "tree\\" + CatalogueTail;
    for (std::size_t start = 0; start < rest.size();) {
        std::size_t slash = rest.find('\\', start);
        OpenBrowserRow(program, chooser, rest.substr(start, slash - start), false);
        start = slash + 1;
        Require(WaitForPathBox(chooser, Work(rest.substr(0, start))),
                "the browser opens " + rest.substr(0, start));
    }
    SelectBrowserRow(program, chooser, "static.ini");
    Expect(WaitForPathBox(chooser, TreeCatalogue() + "static.ini"),
           "a selected file is shown after its folder");
    ClickButton(Control(chooser, "Button"));
    ConfirmMessage(program, "Path saved", "Path saved in verrant.ini");
    Expect(WaitUntilGone(chooser), "the chooser closes once a folder is taken");
    std::string saved;
    Expect(ReadBytes(Work("start\\choose\\verrant.ini"), saved),
           "verrant.ini is written in the start folder");
    ExpectText(saved, TreeCatalogue(), "verrant.ini holds the folder alone, with no line end");

    PressCloseBox(program.main);
    Expect(Finish(program) == 0, "the close box ends the program with exit code 0");
}

// A settings file naming a folder that lost its static.ini.
void SettingsFolderLost() {
    std::string lost = Work("gone\\");
    Program program = Start(FreshStartFolder("lost", &lost));
    ConfirmMessage(program, "static,ini failure", "static.ini not found in " + lost);
    Pause(300);
    Expect(!FileExists(Work("start\\lost\\verrant.ini")), "the settings file is deleted");
    Expect(FindProgramWindow(program, "Searching static.ini") == nullptr, "no chooser is shown at start");
    Expect(!MessageBoxShown(program), "no further question at start");
    ChooseMenuItem(program, 1);
    Expect(Finish(program) == 0, "exit code 0");
}

// "Clear path ..." twice, then a command that needs the folder asks for it.
void ClearPathTwice() {
    std::string tree = TreeCatalogue();
    Program program = Start(FreshStartFolder("clear", &tree));
    Pause(300);
    Expect(!MessageBoxShown(program), "a valid settings file asks nothing at start");
    ChooseMenuItem(program, 12);
    ConfirmMessage(program, "Path cleared", "verrant.ini deleted");
    Expect(!FileExists(Work("start\\clear\\verrant.ini")), "verrant.ini is deleted");
    ChooseMenuItem(program, 12);
    ConfirmMessage(program, "Path cleared failure", "Nothing to clear");
    ChooseMenuItem(program, 3);
    HWND chooser = ChooserWindow(program);
    PressCloseBox(chooser);
    Expect(WaitUntilGone(chooser), "the chooser closes");
    Pause(300);
    Expect(!MessageBoxShown(program), "a command without a folder ends silently");
    ChooseMenuItem(program, 1);
    Expect(Finish(program) == 0, "exit code 0");
}

// ".. doubled objects" with the progress list on: its lines, the report on the desktop, Notepad.
void DoubledObjectsWithProgressList() {
    std::string report = DesktopFolder() + "Doubled_objects.txt";
    DeleteFileA(report.c_str());
    std::string tree = TreeCatalogue();
    Program program = Start(FreshStartFolder("doubled", &tree));
    HWND toggle = Control(program.main, "Button", 1);
    ClickButton(toggle);
    HWND progress = WaitForWindow(program, "List searching window");
    Require(progress != nullptr, "the toggle opens \"List searching window\"");
    Expect(SendMessageA(toggle, BM_GETCHECK, 0, 0) == BST_CHECKED, "the toggle stays down");
    ExpectFrame(progress, 650, 320, 370, 470, "progress list window");
    ExpectStyle(progress, false, false, "progress list window");
    Expect((GetClassLongA(progress, GCL_STYLE) & CS_NOCLOSE) != 0,
           "Alt+F4 cannot close the progress list window");
    HWND list = ProgressList(progress);
    ExpectPlace(list, 10, 20, 350, 430, "progress list");
    LONG style = GetWindowLongA(list, GWL_STYLE);
    Expect((style & LBS_NOINTEGRALHEIGHT) && !(style & LBS_SORT),
           "the list keeps its height and never sorts");
    Expect((GetWindowLongA(list, GWL_EXSTYLE) & WS_EX_CLIENTEDGE) != 0, "the list is sunken");

    ChooseMenuItem(program, 3);
    HWND notepad = WaitForWindowTitled("Doubled_objects", 10000);
    Expect(notepad != nullptr, "Notepad opens the report");
    Strings names = TreeNames();
    Strings expected;
    for (int i = 0; i < static_cast<int>(names.size()); ++i) {
        expected.push_back("Build (" + std::to_string(i) + ") buildings.House$" +
                           names[static_cast<std::size_t>(i)]);
        if (i == 5)
            expected.insert(expected.end(),
                            {Ruler, "Double object (5) => (17): buildings.House$Dup1", Ruler});
        if (i == 20)
            expected.insert(expected.end(),
                            {Ruler, "Double object (20) => (33): buildings.House$Dup2", Ruler});
    }
    expected.insert(expected.end(), {"", "Total number of objects: 40"});
    ExpectLines(ListLines(list), expected, "progress list lines");
    Expect(SendMessageA(list, LB_GETTOPINDEX, 0, 0) == 0, "the list does not scroll to new lines");
    // The scroll bar shows once the lines do not fit.
    Expect((GetWindowLongA(list, GWL_STYLE) & WS_VSCROLL) != 0, "the list has a vertical scroll bar");
    std::string bytes;
    Expect(ReadBytes(report, bytes), "Doubled_objects.txt is on the desktop");
    ExpectText(
        bytes,
        "Doubled objects in your static.ini:\r\n\r\nDouble object (5) => (17): buildings.House$Dup1\r\n"
        "Double object (20) => (33): buildings.House$Dup2\r\n",
        "Doubled_objects.txt");
    SetForegroundWindow(progress);
    Screenshot("progress-list");
    EndProcessesWithWindow("Doubled_objects", program.process.dwProcessId);

    ClickButton(toggle);
    Expect(WaitUntilGone(progress), "the toggle closes the progress list window");
    Expect(SendMessageA(toggle, BM_GETCHECK, 0, 0) == BST_UNCHECKED, "the toggle comes up at the next click");
    ClickButton(toggle);
    HWND again = WaitForWindow(program, "List searching window");
    Require(again != nullptr, "switching on again opens the window");
    Expect(ListLines(ProgressList(again)).empty(), "the new window's list is empty");
    PressCloseBox(program.main);
    Expect(Finish(program) == 0, "exit code 0");
}

// No findings: the message box, shown while the progress list is open, disables that window.
void NoFindingsDisablesProgressList() {
    std::string clean = CleanCatalogue();
    std::string report = DesktopFolder() + "Doubled_objects.txt";
    DeleteFileA(report.c_str());
    Program program = Start(FreshStartFolder("clean", &clean));
    ClickButton(Control(program.main, "Button", 1));
    HWND progress = WaitForWindow(program, "List searching window");
    Require(progress != nullptr, "the progress list opens");
    ChooseMenuItem(program, 3);
    MessageBoxSeen seen = WaitForMessageBox(program);
    ExpectText(seen.title, "No doubled objects", "no-findings title");
    ExpectText(seen.text, "No doubled objects found in your static.ini", "no-findings text");
    Expect(!seen.hasIcon, "the box has no icon");
    Expect(IsWindowEnabled(progress) == FALSE, "the progress list is disabled while the box is shown");
    Expect(IsWindowEnabled(program.main) == FALSE, "the main window is disabled while the box is shown");
    ExpectLines(ListLines(ProgressList(progress)),
                {"Build (0) buildings.House$A", "Build (1) buildings.House$a", "Build (2) buildings.House$B",
                 "", "Total number of objects: 3"},
                "progress lines without findings");
    DismissMessageBox(seen);
    Pause(200);
    Expect(IsWindowEnabled(progress) != FALSE, "the progress list is enabled again");
    Expect(IsWindowEnabled(program.main) != FALSE, "the main window is enabled again");
    Expect(!FileExists(report), "no report without findings");
    PressCloseBox(program.main);
    Expect(Finish(program) == 0, "exit code 0");
}

// A copy of the repository's demo tree for one scenario: some commands rewrite the catalogue.
std::string DemoCopy(const std::string& name) {
    Require(!Settings.demoTree.empty(), "the demo tree is named (" DEMO_TREE_VARIABLE ")");
    CopyFolder(Settings.demoTree, Work(name));
    return Work(name + "\\");
}

struct CliRun {
    long code = -1;
    Strings lines;  // its standard output: the progress lines when asked for
};

CliRun RunCli(const std::string& arguments) {
    Require(!Settings.cli.empty(), "verrant-cli.exe is named (" CLI_VARIABLE ")");
    std::string output = Work("cli-output.txt");
    CliRun run;
    run.code = RunProcess("\"" + Settings.cli + "\" " + arguments, Work(""), output, 30000);
    std::string bytes;
    ReadBytes(output, bytes);
    for (std::string line : SplitLines(bytes)) {
        if (!line.empty() && line.back() == '\r') line.pop_back();
        run.lines.push_back(line);
    }
    return run;
}

std::string FileBytes(const std::string& path) {
    std::string bytes;
    Require(ReadBytes(path, bytes), path + " can be read");
    return bytes;
}

// A Notepad opens the file and shows its bytes; that Notepad is then ended.
void ExpectNotepadShows(const std::string& fileName, const std::string& bytes, const Program& program) {
    HWND notepad = WaitForWindowTitled(fileName + " - ", 10000);
    if (!Expect(notepad != nullptr, "Notepad opens " + fileName)) return;
    bool same = false;
    for (int waited = 0; !same && waited <= 3000; waited += 50) {
        same = NotepadText(notepad) == bytes;
        if (!same) Pause(50);
    }
    Expect(same, "Notepad shows the bytes of " + fileName + " (" +
                     std::to_string(NotepadText(notepad).size()) + " characters shown, " +
                     std::to_string(bytes.size()) + " in the file)");
    EndProcessesWithWindow(fileName + " - ", program.process.dwProcessId);
}

// A menu command whose report must be what verrant-cli writes for the same arguments: on the desktop
// and in Notepad; with the progress list given, its lines are what verrant-cli prints.
struct ReportCommand {
    int id;
    std::string cliArguments;
    std::string fileName;
    long cliExit;
};

void ExpectReportAsCli(Program& program, const ReportCommand& command, HWND progress) {
    std::string report = DesktopFolder() + command.fileName, folder = Work("cli-reports\\");
    MakeFolders(folder);
    DeleteFileA(report.c_str());
    DeleteFileA((folder + command.fileName).c_str());
    CliRun run = RunCli(command.cliArguments + (progress ? " --progress" : "") + " --report-dir " + folder);
    Require(run.code == command.cliExit && (progress == nullptr || !run.lines.empty()),
            "verrant-cli " + command.cliArguments + " writes " + command.fileName + " (exit " +
                std::to_string(run.code) + ")");
    std::string expected = FileBytes(folder + command.fileName);
    ChooseMenuItem(program, command.id);
    ExpectNotepadShows(command.fileName, expected, program);
    std::string written;
    Expect(ReadBytes(report, written), command.fileName + " is on the desktop");
    Expect(written == expected, command.fileName + " holds what verrant-cli writes");
    if (progress != nullptr)
        ExpectLines(ListLines(ProgressList(progress)), run.lines,
                    "progress lines of " + command.cliArguments);
}

// "(", digits, ")", with nothing around them but blanks and tabs.
bool IsNumberLine(const std::string& line) {
    std::size_t first = line.find_first_not_of(" \t"), last = line.find_last_not_of(" \t\r");
    if (first == std::string::npos || last - first < 2) return false;
    if (line[first] != '(' || line[last] != ')') return false;
    for (std::size_t i = first + 1; i < last; ++i)
        if (line[i] < '0' || line[i] > '9') return false;
    return true;
}

// ".. missing objects": the window, "OK" without a pick, the demo map, and back to the main window.
void MissingObjectsWindow() {
    std::string tree = DemoCopy("demo-map");
    std::string catalogue = tree + CatalogueTail, mapFolder = tree + "mods\\mapmods\\maps\\Coast\\";
    std::string report = DesktopFolder() + "Missing_objects.txt";
    DeleteFileA(report.c_str());
    MakeFolders(Work("cli-map"));
    CliRun reference = RunCli("missing-objects --progress --map " + mapFolder +
                              "actors.static --report-dir " + Work("cli-map"));
    Require(reference.code == 1, "verrant-cli reports missing objects of the demo map (exit " +
                                     std::to_string(reference.code) + ")");
    std::string expected = FileBytes(Work("cli-map\\Missing_objects.txt"));
    Require(!reference.lines.empty(), "verrant-cli prints the progress lines");

    Program program = Start(FreshStartFolder("map", &catalogue));
    ClickButton(Control(program.main, "Button", 1));
    HWND progress = WaitForWindow(program, "List searching window");
    Require(progress != nullptr, "the progress list opens");
    ChooseMenuItem(program, 2);
    HWND window = WaitForWindow(program, "Searching missing objects");
    Require(window != nullptr, "\".. missing objects\" opens \"Searching missing objects\"");
    ExpectFrame(window, 300, 320, 324, 365, "missing objects window");
    ExpectStyle(window, true, true, "missing objects window");
    HWND label = Control(window, "Static");
    ExpectText(WindowText(label), "Select mod maps file of type 'actors.static' to examine",
               "missing objects label");
    RECT labelPlace = ChildPlace(label);
    Expect(labelPlace.left == 10 && labelPlace.top == 10 && labelPlace.right == 284,
           "the label stands at 10,10 and is 284 wide");
    ExpectPlace(Control(window, "SysListView32"), 10, 30, 304, 250, "file list");
    HWND status = Control(window, "Edit");
    ExpectPlace(status, 10, 300, 304, 20, "status line");
    Expect((GetWindowLongA(status, GWL_EXSTYLE) & WS_EX_CLIENTEDGE) != 0, "the status line is sunken");
    ExpectText(WindowText(status), "", "status line at first");
    HWND close = Control(window, "Button", 0), ok = Control(window, "Button", 1);
    ExpectText(WindowText(close), "Close", "first button");
    ExpectPlace(close, 10, 330, 50, 25, "\"Close\"");
    ExpectText(WindowText(ok), "OK", "second button");
    ExpectPlace(ok, 289, 330, 25, 25, "\"OK\"");
    Strings rows = SplitLines(Probe(program, window, ProbeRows));
    ExpectText(rows.empty() ? "" : rows[0], "columns\tName\tType\tModified", "file list columns");
    ExpectLines(BrowserRowNames(program, window), {"..", "Coast"}, "the file list opens on the maps folder");
    ExpectCaptionsFit(program, window, "missing objects window");

    ClickButton(ok);
    Expect(WaitForPathBox(window, "No file selected"),
           "\"OK\" with nothing picked shows \"No file selected\"");
    Pause(200);
    Expect(!MessageBoxShown(program), "\"OK\" with nothing picked shows no message box");

    OpenBrowserRow(program, window, "Coast", false);
    Strings mapRows;
    for (int waited = 0; waited <= 5000 && mapRows != Strings{"..", "actors.static"}; waited += 100) {
        if (waited > 0) Pause(100);
        mapRows = BrowserRowNames(program, window);
    }
    ExpectLines(mapRows, {"..", "actors.static"}, "the map folder's rows");
    SelectBrowserRow(program, window, "actors.static");
    std::string picked = mapFolder + "actors.static";
    std::string shown = picked.size() <= 43 ? picked : "..." + picked.substr(picked.size() - 40);
    Expect(WaitForPathBox(window, shown),
           "the status line shows the pick cut to 43 characters: \"" + PathBoxText(window) + "\"");
    Screenshot("missing-objects");

    ClickButton(ok);
    ExpectNotepadShows("Missing_objects.txt", expected, program);
    std::string written;
    Expect(ReadBytes(report, written), "Missing_objects.txt is on the desktop");
    Expect(written == expected, "Missing_objects.txt holds what verrant-cli writes for the same map");
    ExpectLines(ListLines(ProgressList(progress)), reference.lines, "progress lines of the map check");
    Expect(!MessageBoxShown(program), "a check with findings shows no message box");
    Expect(IsWindowVisible(window) != FALSE, "the window stays open after a check");

    ClickButton(close);
    Expect(WaitUntilGone(window), "\"Close\" closes the window");
    ChooseMenuItem(program, 12);  // the main window's commands run again
    ConfirmMessage(program, "Path cleared", "verrant.ini deleted");
    PressCloseBox(program.main);
    Expect(Finish(program) == 0, "exit code 0");
}

// Renumbering and denumbering a copy of the demo catalogue, then both mission-builder lists, each
// against verrant-cli on a second copy.
void RewriteAndLists() {
    std::string catalogue = DemoCopy("demo-rewrite") + CatalogueTail;
    std::string reference = DemoCopy("demo-rewrite-cli") + CatalogueTail;
    std::string original = FileBytes(catalogue + "static.ini");

    Program program = Start(FreshStartFolder("rewrite", &catalogue));
    ClickButton(Control(program.main, "Button", 1));
    HWND progress = WaitForWindow(program, "List searching window");
    Require(progress != nullptr, "the progress list opens");

    CliRun renumbered = RunCli("renumber --progress --catalogue " + reference);
    Require(renumbered.code == 0 && !renumbered.lines.empty(),
            "verrant-cli renumbers its copy, printing the progress lines");
    ChooseMenuItem(program, 6);
    ConfirmMessage(program, "Renumber static.ini", "Done");
    std::string after = FileBytes(catalogue + "static.ini");
    Expect(after == FileBytes(reference + "static.ini"), "the renumbered catalogue is verrant-cli's");
    Expect(after != original && after.find("(0)\r\n[buildings.House$Signpost]\r\n") != std::string::npos,
           "renumbering puts (0) above the first building header");
    Expect(!FileExists(catalogue + "static.ini.tmp"), "no static.ini.tmp is left");
    ExpectLines(ListLines(ProgressList(progress)), renumbered.lines, "progress lines of renumbering");

    CliRun denumbered = RunCli("denumber --progress --catalogue " + reference);
    Require(denumbered.code == 0 && !denumbered.lines.empty(),
            "verrant-cli denumbers its copy, printing the progress lines");
    ChooseMenuItem(program, 7);
    ConfirmMessage(program, "Denumber static.ini", "Done");
    after = FileBytes(catalogue + "static.ini");
    Expect(after == FileBytes(reference + "static.ini"), "the denumbered catalogue is verrant-cli's");
    Strings lines = SplitLines(after);
    Expect(std::none_of(lines.begin(), lines.end(), IsNumberLine), "no number line is left");
    Expect(!FileExists(catalogue + "static.ini.tmp"), "no static.ini.tmp is left");
    ExpectLines(ListLines(ProgressList(progress)), denumbered.lines, "progress lines of denumbering");

    ExpectReportAsCli(program, {8, "fmb-list --catalogue " + reference, "Static_list_FMB.txt", 0}, nullptr);
    ExpectReportAsCli(program, {9, "fmb-plus-list --catalogue " + reference, "Static_list_FMBplus.txt", 0},
                      nullptr);
    Expect(!MessageBoxShown(program), "the lists show no message box");
    ChooseMenuItem(program, 1);
    Expect(Finish(program) == 0, "exit code 0");
}

// "Open static.ini": Notepad on the catalogue, started by its bare name in the catalogue folder.
// A list written first leaves the desktop current, where a decoy static.ini waits for a Notepad
// started without its working folder.
void OpenCatalogueButton() {
    std::string tree = TreeCatalogue(), decoy = DesktopFolder() + "static.ini";
    WriteBytes(decoy, "decoy\r\n");
    Program program = Start(FreshStartFolder("open", &tree));
    ChooseMenuItem(program, 8);
    Expect(WaitForWindowTitled("Static_list_FMB.txt - ", 10000) != nullptr, "the list opens in Notepad");
    EndProcessesWithWindow("Static_list_FMB.txt - ", program.process.dwProcessId);
    ClickButton(Control(program.main, "Button", 0));
    ExpectNotepadShows("static.ini", FileBytes(tree + "static.ini"), program);
    Expect(!MessageBoxShown(program), "no message box");
    DeleteFileA(decoy.c_str());
    ChooseMenuItem(program, 1);
    Expect(Finish(program) == 0, "exit code 0");
}

// Both mesh reference commands on the demo tree, against verrant-cli on the same tree.
void MeshReferencesOnDemoTree() {
    std::string catalogue = DemoCopy("demo-mesh") + CatalogueTail;
    Program program = Start(FreshStartFolder("mesh", &catalogue));
    ClickButton(Control(program.main, "Button", 1));
    HWND progress = WaitForWindow(program, "List searching window");
    Require(progress != nullptr, "the progress list opens");
    ExpectReportAsCli(program, {5, "wrong-sim-references --catalogue " + catalogue, "Missing_3do.txt", 1},
                      progress);
    Expect(FindProgramWindow(program, "Wait") == nullptr, "the Wait window is closed once the report opens");
    ExpectReportAsCli(program,
                      {14, "doubled-used-sims --catalogue " + catalogue, "Doubled_sims_or_meshes.txt", 1},
                      progress);
    Expect(!MessageBoxShown(program), "the mesh checks show no message box");
    ChooseMenuItem(program, 1);
    Expect(Finish(program) == 0, "exit code 0");
}

// Many mods and many entries keep the mesh search, and with it the Wait window, busy for a while.
const int BigTreeEntries = 20000, BigTreeMods = 300;

std::string MakeBigMeshTree() {
    std::string root = Work("mesh-big\\"), catalogue = root + CatalogueTail;
    MakeFolders(catalogue);
    std::string text = "[***]\r\nTitle Generated\r\n";
    for (int i = 0; i < BigTreeEntries; ++i)
        text += "[buildings.House$Gen" + std::to_string(i) + "]\r\nMesh 3do/Gen/F" + std::to_string(i % 100) +
                "/m" + std::to_string(i) + ".sim\r\n";
    WriteBytes(catalogue + "static.ini", text);
    for (int m = 0; m < BigTreeMods; ++m)
        MakeFolders(root + "mods\\Mod" + std::to_string(m) + "\\3do\\Gen\\F" + std::to_string(m % 100));
    return catalogue;
}

// The Wait window of ".. wrong sim references": caption only, its place and size, a moving bar.
void WaitWindowDuringLongRun() {
    std::string catalogue = MakeBigMeshTree();
    std::string report = DesktopFolder() + "Missing_3do.txt";
    DeleteFileA(report.c_str());
    Program program = Start(FreshStartFolder("mesh-big", &catalogue));
    ChooseMenuItem(program, 5);
    HWND wait = nullptr;
    LARGE_INTEGER frequency, began, seenAt, gone;
    QueryPerformanceFrequency(&frequency);
    QueryPerformanceCounter(&began);
    for (int waited = 0; wait == nullptr && waited < 10000; waited += 5) {
        wait = FindProgramWindow(program, "Wait");
        if (wait == nullptr) Pause(5);
    }
    Require(wait != nullptr, "the Wait window appears during the run");
    QueryPerformanceCounter(&seenAt);
    ExpectFrame(wait, 400, 340, 180, 40, "Wait window");
    LONG style = GetWindowLongA(wait, GWL_STYLE);
    Expect((style & WS_CAPTION) == WS_CAPTION, "the Wait window has a title bar");
    Expect((style & (WS_SYSMENU | WS_THICKFRAME | WS_MINIMIZEBOX | WS_MAXIMIZEBOX)) == 0,
           "the Wait window has no system menu, close box or sizing border");
    HWND bar = Control(wait, "msctls_progress32");
    Require(bar != nullptr, "the Wait window holds a progress bar");
    ExpectPlace(bar, 10, 10, 160, 20, "progress bar");
    Screenshot("wait-window");
    DWORD_PTR low = 99, high = 0, position = 0, highest = 0;
    SendMessageTimeoutW(bar, PBM_GETRANGE, TRUE, 0, SMTO_NORMAL, 5000, &low);
    SendMessageTimeoutW(bar, PBM_GETRANGE, FALSE, 0, SMTO_NORMAL, 5000, &high);
    Expect(low == 0 && high == 35,
           "the bar runs from 0 to 35: " + std::to_string(low) + ".." + std::to_string(high));
    while (IsWindow(wait) && IsWindowVisible(wait)) {
        if (SendMessageTimeoutW(bar, PBM_GETPOS, 0, 0, SMTO_NORMAL, 1000, &position))
            highest = std::max(highest, position);
        Pause(20);
    }
    QueryPerformanceCounter(&gone);
    Expect(highest > 0 && highest <= 35,
           "the bar moves within its range: highest " + std::to_string(highest));
    std::printf("    the Wait window was seen %.0f ms after the command and stayed %.0f ms\n",
                1000.0 * static_cast<double>(seenAt.QuadPart - began.QuadPart) / frequency.QuadPart,
                1000.0 * static_cast<double>(gone.QuadPart - seenAt.QuadPart) / frequency.QuadPart);
    HWND notepad = WaitForWindowTitled("Missing_3do.txt - ", 20000);
    Expect(notepad != nullptr, "Notepad opens Missing_3do.txt");
    std::string written;
    Expect(ReadBytes(report, written) &&
               written.find("Wrong sim references in your static.ini:\r\n\r\n") != std::string::npos &&
               written.find("Gen" + std::to_string(BigTreeEntries - 1)) != std::string::npos,
           "Missing_3do.txt lists the generated entries");
    EndProcessesWithWindow("Missing_3do.txt - ", program.process.dwProcessId);
    ChooseMenuItem(program, 1);
    Expect(Finish(program) == 0, "exit code 0");
}

// The program file carries its version and its icon.
void ProgramFileResources() {
    DWORD ignored = 0;
    DWORD size = GetFileVersionInfoSizeA(Settings.program.c_str(), &ignored);
    Require(size > 0, "verrant.exe has a version resource");
    std::string data(size, '\0');
    Require(GetFileVersionInfoA(Settings.program.c_str(), 0, size, data.data()) != FALSE,
            "the version resource reads");
    char* product = nullptr;
    UINT length = 0;
    Expect(VerQueryValueA(data.data(), "\\StringFileInfo\\040904B0\\ProductName",
                          reinterpret_cast<void**>(&product), &length) &&
               std::string(product) == "Verrant",
           "the product name is Verrant");
    Expect(ExtractIconExA(Settings.program.c_str(), -1, nullptr, nullptr, 0) >= 1,
           "verrant.exe carries an icon");
}

struct Scenario {
    const char* name;
    std::function<void()> run;
};

}  // namespace

int main(int argc, char** argv) {
    if (argc < 4) {
        std::printf("usage: e2e_driver PROGRAM PROBE_DLL WORK_FOLDER [SHOTS_FOLDER]\n0 passed, 1 failed\n");
        return 2;
    }
    Settings.program = argv[1];
    Settings.probeLibrary = argv[2];
    Settings.workRoot = argv[3];
    if (Settings.workRoot.back() != '\\') Settings.workRoot += '\\';
    if (argc > 4) Settings.shotsFolder = std::string(argv[4]) + "\\";
    char value[MAX_PATH] = "";
    if (GetEnvironmentVariableA(DEMO_TREE_VARIABLE, value, sizeof value)) Settings.demoTree = value;
    if (GetEnvironmentVariableA(CLI_VARIABLE, value, sizeof value)) Settings.cli = value;
    SetEnvironmentVariableA(PROBE_FILE_VARIABLE, (Settings.workRoot + "probe-answer.txt").c_str());
    SetErrorMode(SEM_FAILCRITICALERRORS | SEM_NOOPENFILEERRORBOX);
    MakeFolders(Settings.workRoot);
    MakeFixtures();

    const Scenario scenarios[] = {
        {"program file: version resource and icon", ProgramFileResources},
        {"first start: question, chooser, closing it; main window, buttons, menu table; Close",
         FirstStartAndMainWindow},
        {"chooser: wrong folder, then a folder with static.ini; settings file bytes; close box",
         ChooseFolderAndSave},
        {"settings file naming a folder without static.ini", SettingsFolderLost},
        {"Clear path twice; a command without a folder", ClearPathTwice},
        {"doubled objects: progress list lines, report on the desktop, Notepad; toggle off and on",
         DoubledObjectsWithProgressList},
        {"no findings: message box disables the progress list", NoFindingsDisablesProgressList},
        {"missing objects: window, no pick, the demo map's report and progress lines, Close",
         MissingObjectsWindow},
        {"renumber and denumber the demo catalogue; both mission-builder lists", RewriteAndLists},
        {"\"Open static.ini\" starts Notepad on the catalogue", OpenCatalogueButton},
        {"wrong sim references and doubled used sims on the demo tree", MeshReferencesOnDemoTree},
        {"the Wait window during a long mesh search", WaitWindowDuringLongRun},
    };
    int passed = 0, failed = 0;
    for (const Scenario& scenario : scenarios) {
        Failures.clear();
        try {
            scenario.run();
        } catch (const ScenarioStop& stop) {
            Failures.push_back("stopped: " + stop.why);
        } catch (const std::exception& error) {
            Failures.push_back(std::string("stopped: ") + error.what());
        }
        EndProcessesWithWindow("Notepad", 0);
        EndProcessesWithWindow("Verrant V.1.3", 0);
        if (Failures.empty()) {
            ++passed;
            std::printf("PASS: %s\n", scenario.name);
        } else {
            ++failed;
            std::printf("FAIL: %s\n", scenario.name);
            for (const std::string& failure : Failures) std::printf("    %s\n", failure.c_str());
        }
        std::fflush(stdout);
    }
    if (!StartTimes.empty()) {
        std::sort(StartTimes.begin(), StartTimes.end());
        std::printf(
            "start-up to a visible main window: fastest %.0f ms, median %.0f ms, slowest %.0f ms (%zu "
            "starts)\n",
            StartTimes.front(), StartTimes[StartTimes.size() / 2], StartTimes.back(), StartTimes.size());
    }
    std::printf("%d passed, %d failed\n", passed, failed);
    return failed == 0 ? 0 : 1;
}
