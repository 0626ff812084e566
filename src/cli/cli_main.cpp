// verrant-cli: the checks without windows, for scripts and modpack builds. Reports are written
// byte for byte as the desktop program writes them; exit status 0 nothing found (or the catalogue
// rewritten, or the list written), 1 findings, 2 bad usage or a catalogue or report that could not
// be read or written.
#include "cli/cli_missing_objects.h"
#include "cli/cli_options.h"
#include "commands/command_table.h"
#include "output/app_state.h"
#include "output/progress_list.h"
#include "platform/headless/headless.h"

#include <cstdio>

namespace {

const int ExitNothingFound = 0, ExitFindings = 1, ExitTrouble = 2;

void PrintHelp(std::FILE* to) {
    std::fprintf(to,
                 "usage: verrant-cli COMMAND --catalogue DIR [--report-dir DIR] [--progress]\n"
                 "  --catalogue DIR   the folder that holds static.ini\n"
                 "  --report-dir DIR  where the report is written (default: the current folder)\n"
                 "  --progress        print the progress list's lines to standard output\n"
                 "  --map FILE        missing-objects: the map file; without --catalogue, its tree's catalogue\n"
                 "commands:\n");
    for (const Command& command : Commands)
        if (command.cliName) std::fprintf(to, "  %-22s %s\n", command.cliName, command.summary);
    std::fprintf(to, "exit status: 0 nothing found, catalogue rewritten or list written; 1 findings reported;\n"
                     "  2 bad usage, or a catalogue, report or list that could not be read or written\n");
}

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
    const Command* chosen = CommandNamed(options.command);
    if (!chosen) {
        std::fprintf(stderr, "verrant-cli: unknown command %s\n", options.command.c_str());
        PrintHelp(stderr);
        return ExitTrouble;
    }

    ClearAppState();
    StartFolder = ProgramFolder(".");
    if (!options.catalogue.empty()) CatalogueFolder = ProgramFolder(options.catalogue);
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
    CommandResult result = RunCommand(*chosen, mapSelection);
    std::fflush(stdout);
    switch (result) {
        case CommandResult::NothingFound: return ExitNothingFound;
        case CommandResult::Done: return ExitNothingFound;
        case CommandResult::Findings: return ExitFindings;
        case CommandResult::NoFolder:
            std::fprintf(stderr, "verrant-cli: no catalogue folder: give --catalogue DIR\n");
            return ExitTrouble;
        case CommandResult::Failed: return ExitTrouble;
    }
    return ExitTrouble;
}
