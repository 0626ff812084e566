// verrant-cli: the checks without windows, for scripts and modpack builds. Reports are written
// byte for byte as the desktop program writes them; exit status 0 nothing found (or the catalogue
// rewritten, or the list written), 1 findings, 2 bad usage or a catalogue or report that could not
// be read or written.
#include "cli/cli_missing_objects.h"
#include "cli/cli_options.h"
#include "cli/cli_tree.h"
#include "commands/command_table.h"
#include "location/derived_paths.h"
#include "output/app_state.h"
#include "output/progress_list.h"
#include "platform/headless/headless.h"

#include <cstdio>

namespace {

const int ExitNothingFound = 0, ExitFindings = 1, ExitTrouble = 2;
// The desktop program's version, as its title and version resource give it.
const char* const Version = "1.3";

void PrintHelp(std::FILE* to) {
    std::fprintf(to,
                 "usage: verrant-cli COMMAND (--catalogue DIR | --tree DIR) [--report-dir DIR] [--progress]\n"
                 "       verrant-cli --help | --version\n"
                 "  --catalogue DIR   the folder that holds static.ini\n"
                 "  --tree DIR        the game folder, its mods folder or any folder inside the tree: static.ini\n"
                 "                    is looked for in mods\\std\\com\\maddox\\il2\\objects\\ there or above\n"
                 "  --report-dir DIR  where the report is written (default: the current folder)\n"
                 "  --progress        print the progress list's lines to standard output\n"
                 "  --map FILE        missing-objects: the map file; without --catalogue or --tree, its tree's\n"
                 "                    catalogue\n"
                 "  --all-maps        missing-objects: every map of the tree instead of one\n"
                 "commands:\n");
    for (const Command& command : Commands) {
        if (!command.cliName) continue;
        std::string name = command.cliName;
        if (command.cliOption) name = name + " " + command.cliOption;
        std::fprintf(to, "  %-27s %s\n", name.c_str(), command.summary);
    }
    std::fprintf(to, "exit status: 0 nothing found, catalogue rewritten or list written; 1 findings reported;\n"
                     "  2 bad usage, or a catalogue, maps folder, report or list that could not be read or written\n"
                     "  (check-all: 2 when any check could not run, else 1 when any found something)\n");
}

void PrintSummaryLine(const std::string& line) { std::printf("%s\n", line.c_str()); }

// After a message box's line, the file and the system's reason behind it, when a file operation failed.
void TellFileFailure(const ShownMessage&) {
    std::string failure = HeadlessTakeFailure();
    if (!failure.empty()) std::fprintf(stderr, "verrant-cli: %s\n", failure.c_str());
}

// The program's own form of a host folder: absolute, "\" separators, ending in "\".
std::string ProgramFolder(const std::string& hostFolder) {
    std::string folder = HeadlessProgramPath(hostFolder);
    if (folder.empty() || folder.back() != '\\') folder += '\\';
    return folder;
}

}  // namespace

int main(int argc, char** argv) {
    InitPlatform();
    CliOptions options;
    std::string error;
    if (!ParseCliOptions(std::vector<std::string>(argv + 1, argv + argc), options, error)) {
        std::fprintf(stderr, "verrant-cli: %s\n", error.c_str());
        PrintHelp(stderr);
        return ExitTrouble;
    }
    if (options.help) {
        PrintHelp(stdout);
        return ExitNothingFound;
    }
    if (options.version) {
        std::printf("verrant-cli %s\n", Version);
        return ExitNothingFound;
    }
    const Command* chosen = CommandNamed(options.command, options.allMaps ? "--all-maps" : "");
    if (!chosen) {
        std::fprintf(stderr, "verrant-cli: unknown command %s%s\n", options.command.c_str(),
                     options.allMaps ? " --all-maps" : "");
        PrintHelp(stderr);
        return ExitTrouble;
    }

    ClearAppState();
    StartFolder = ProgramFolder(".");
    if (!options.catalogue.empty()) {
        CatalogueFolder = ProgramFolder(options.catalogue);
        MapsPattern = DeriveMapsPattern(CatalogueFolder);
    }
    if (!options.tree.empty() && !UseTreeCatalogue(ProgramFolder(options.tree))) return ExitTrouble;
    std::string reportDir = options.reportDir.empty() ? "." : options.reportDir;
    // Through the file layer, so that the folder's name matches as the catalogue's does.
    if (!MakeFolderCurrent(ProgramFolder(reportDir))) {
        Handle file = OpenForReading(HeadlessProgramPath(reportDir));
        std::fprintf(stderr, "verrant-cli: report folder %s %s\n", reportDir.c_str(),
                     file != 0 ? "is a file" : "does not exist");
        CloseFile(file);
        return ExitTrouble;
    }
    HeadlessSetDesktopFolder(ProgramFolder(reportDir));
    HeadlessEcho(options.progress, true);
    HeadlessOnMessage(TellFileFailure);
    if (options.progress) {
        ProgressListOn = true;
        OpenProgressList();
    }

    std::string mapSelection;
    if (chosen->takesMap && !PrepareMapCheck(options, mapSelection)) return ExitTrouble;
    if (chosen->takesMapsFolder && !CatalogueFolder.empty()) TellMissingMapsFolder();
    CommandResult result = RunCommand(*chosen, mapSelection, PrintSummaryLine);
    std::fflush(stdout);
    switch (result) {
        case CommandResult::NothingFound: return ExitNothingFound;
        case CommandResult::Done: return ExitNothingFound;
        case CommandResult::Findings: return ExitFindings;
        case CommandResult::NoFolder:
            std::fprintf(stderr, "verrant-cli: no catalogue folder: give --catalogue DIR or --tree DIR\n");
            return ExitTrouble;
        case CommandResult::Failed: return ExitTrouble;
    }
    return ExitTrouble;
}
