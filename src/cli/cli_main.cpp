// verrant-cli: the checks without windows, for scripts and modpack builds. Reports are written
// byte for byte as the desktop program writes them; exit status 0 nothing found (or the catalogue
// rewritten, or the list written), 1 findings, 2 bad usage or a catalogue or report that could not
// be read or written.
#include "checks/doubled_objects.h"
#include "checks/empty_references.h"
#include "checks/irregular_entries.h"
#include "checks/mesh_references.h"
#include "cli/cli_missing_objects.h"
#include "cli/cli_options.h"
#include "location/derived_paths.h"
#include "platform/headless/headless.h"
#include "rewrite/mission_builder_list.h"
#include "rewrite/renumbering.h"
#include "shell/app_state.h"
#include "shell/event_loop.h"
#include "shell/progress_list.h"

#include <cstdio>
#include <functional>

namespace {

struct CliCommand {
    const char* name;
    const char* summary;
    std::function<CommandResult(const CliOptions&)> run;
};

// The rewrite and list commands take the folder, as the menu gives it once one is known.
CommandResult InCatalogueFolder(CommandResult (*command)(const std::string&, const std::string&),
                                const std::string& mode) {
    if (!EnsureCatalogueFolderKnown()) return CommandResult::NoFolder;
    return command(CatalogueFolder, mode);
}

// The mesh reference run takes the mods root of the folder, as the menu gives it.
CommandResult WithModsRoot(const std::string& mode) {
    if (!EnsureCatalogueFolderKnown()) return CommandResult::NoFolder;
    return CheckMeshReferences(DeriveModsRoot(CatalogueFolder), mode);
}

const CliCommand Commands[] = {
    {"doubled-objects", "building headers whose section names occur more than once",
     [](const CliOptions&) { return FindDoubledObjects(); }},
    {"irregular-entries", "lines that begin with none of the known prefixes",
     [](const CliOptions&) { return CheckIrregularEntries(); }},
    {"empty-references", "Mesh, MeshLive and MeshDead lines without a value",
     [](const CliOptions&) {
         return EnsureCatalogueFolderKnown() ? FindEmptyReferences(CatalogueFolder) : CommandResult::NoFolder;
     }},
    {"renumber", "rewrites static.ini with a number line above every building header",
     [](const CliOptions&) { return InCatalogueFolder(RenumberCatalogue, "renumber"); }},
    {"denumber", "rewrites static.ini without its number lines",
     [](const CliOptions&) { return InCatalogueFolder(RenumberCatalogue, "denumber"); }},
    {"fmb-list", "object list for the mission builder, without plates (Static_list_FMB.txt)",
     [](const CliOptions&) { return InCatalogueFolder(CreateMissionBuilderList, "fmb"); }},
    {"fmb-plus-list", "object list for FMB+, with plates (Static_list_FMBplus.txt)",
     [](const CliOptions&) { return InCatalogueFolder(CreateMissionBuilderList, "fmb+"); }},
    {"missing-objects", "objects a map (--map FILE) places that the catalogue lacks", RunMissingObjectsCommand},
    {"wrong-sim-references", "mesh files that no 3do folder of a mod holds",
     [](const CliOptions&) { return WithModsRoot("missing"); }},
    {"doubled-used-sims", "objects whose MeshLive and MeshDead are the same file",
     [](const CliOptions&) { return WithModsRoot("doubled"); }},
};

const int ExitNothingFound = 0, ExitFindings = 1, ExitTrouble = 2;

void PrintHelp(std::FILE* to) {
    std::fprintf(to,
                 "usage: verrant-cli COMMAND --catalogue DIR [--report-dir DIR] [--progress]\n"
                 "  --catalogue DIR   the folder that holds static.ini\n"
                 "  --report-dir DIR  where the report is written (default: the current folder)\n"
                 "  --progress        print the progress list's lines to standard output\n"
                 "  --map FILE        missing-objects: the map file; without --catalogue, its tree's catalogue\n"
                 "commands:\n");
    for (const CliCommand& command : Commands) std::fprintf(to, "  %-22s %s\n", command.name, command.summary);
    std::fprintf(to, "exit status: 0 nothing found, catalogue rewritten or list written; 1 findings reported;\n"
                     "  2 bad usage, or a catalogue, report or list that could not be read or written\n");
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
    const CliCommand* chosen = nullptr;
    for (const CliCommand& command : Commands)
        if (options.command == command.name) chosen = &command;
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
        std::fprintf(stderr, "verrant-cli: report folder %s does not exist\n", reportDir.c_str());
        return ExitTrouble;
    }
    HeadlessSetDesktopFolder(ProgramFolder(reportDir));
    HeadlessEcho(options.progress, true);
    if (options.progress) {
        ProgressListOn = true;
        OpenProgressList();
    }

    CommandResult result = chosen->run(options);
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
