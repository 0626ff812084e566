// verrant-bench: times every verrant-cli command on one generated tree, beside a straightforward
// baseline of the same command and the plain read of the catalogue (the floor), each in a child
// process of its own, and prints one table. Each run of a baseline is this program started again
// with --baseline NAME.
#include "baselines.h"
#include "tree_generator.h"

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <functional>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <map>
#include <set>
#include <sstream>
#include <string>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>
#include <vector>

namespace fs = std::filesystem;

namespace {

// One row per command. The baseline writes the same report where it can, so the table also tells
// whether the command and the plain method agree; "@static.ini" compares the rewritten catalogue.
// check-all's baseline is the single commands it runs, each timed alone: their sum.
struct BenchRow {
    const char* command;     // with an option that picks the command, as --help lists it
    const char* extraWords;  // "{map}" stands for the map file
    const char* baseline;    // "@singles": the sum of the rows named in CheckAllParts
    const char* compared;    // "" when the two outputs are not comparable
    bool rewritesCatalogue;  // each run gets a fresh copy of static.ini
    bool searchesMeshes = false;  // also measured against one listing of the mods tree
};

const BenchRow Rows[] = {
    {"doubled-objects", "", "pairwise", "Doubled_objects.txt", false},
    {"irregular-entries", "", "prefix-table", "Irregular_entrys.txt", false},
    {"empty-references", "", "bare-keys", "Empty_references.txt", false},
    {"doubled-used-sims", "", "mesh-index", "Doubled_sims_or_meshes.txt", false},
    {"wrong-sim-references", "", "open-per-mesh", "", false, true},
    {"missing-objects", "--map {map}", "linear-walk", "Missing_objects.txt", false},
    {"missing-objects --all-maps", "", "name-set-per-map", "Missing_objects_all_maps.txt", false},
    {"renumber", "", "two-passes", "@static.ini", true},
    {"denumber", "", "one-pass", "@static.ini", true},
    {"fmb-list", "", "entry-list", "Static_list_FMB.txt", false},
    {"fmb-plus-list", "", "entry-list-plus", "Static_list_FMBplus.txt", false},
    {"check-all", "", "@singles", "", false},
};
const char* const CheckAllParts[] = {"doubled-objects",      "irregular-entries", "empty-references",
                                     "wrong-sim-references", "doubled-used-sims", "missing-objects --all-maps"};

struct BenchOptions {
    TreeShape shape;
    std::string tree = BENCH_TREE;
    std::string cli = VERRANT_CLI;
    int runs = 3;
    double repeatLimit = 10;  // seconds; a run longer than this is not repeated
    std::string only;         // one command, "" for all
};

// Times are the child's processor time, user and system: on a machine shared with other work the
// wall time says more about the neighbours than about the command.
struct Measure {
    double seconds = 0;
    double wallSeconds = 0;
    long peakKb = 0;
    int status = -1;
    bool ran = false;
};

struct Places {
    std::string catalogueFolder, modsRoot, mapFile, scratch, commandReports, baselineReports, copyFolder;
};

std::string Self;

// Runs argv with its output thrown away; its times and its own peak resident size.
Measure RunChild(const std::vector<std::string>& words) {
    Measure measure;
    std::vector<char*> argv;
    for (const std::string& word : words) argv.push_back(const_cast<char*>(word.c_str()));
    argv.push_back(nullptr);
    auto start = std::chrono::steady_clock::now();
    pid_t child = fork();
    if (child == 0) {
        int null = open("/dev/null", O_WRONLY);
        dup2(null, 1);
        dup2(null, 2);
        execv(argv[0], argv.data());
        _exit(127);
    }
    int status = 0;
    rusage usage{};
    if (child < 0 || wait4(child, &status, 0, &usage) != child) return measure;
    measure.wallSeconds = std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    measure.seconds = static_cast<double>(usage.ru_utime.tv_sec + usage.ru_stime.tv_sec) +
                      static_cast<double>(usage.ru_utime.tv_usec + usage.ru_stime.tv_usec) / 1e6;
    measure.peakKb = usage.ru_maxrss;
    measure.status = WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
    measure.ran = true;
    return measure;
}

void FreshFolder(const std::string& folder) {
    std::error_code error;
    fs::remove_all(folder, error);
    fs::create_directories(folder, error);
}

// Best time and highest peak over a few runs; slow runs are not repeated.
Measure Best(const BenchOptions& options, const std::function<void()>& prepare,
             const std::vector<std::string>& words) {
    Measure best;
    for (int run = 0; run < options.runs; ++run) {
        prepare();
        Measure measure = RunChild(words);
        if (!best.ran || measure.seconds < best.seconds) {
            long peak = std::max(best.peakKb, measure.peakKb);
            best = measure;
            best.peakKb = peak;
        } else {
            best.peakKb = std::max(best.peakKb, measure.peakKb);
        }
        if (measure.wallSeconds > options.repeatLimit) break;
    }
    return best;
}

std::string ReadWhole(const std::string& path, bool& exists) {
    std::ifstream in(path, std::ios::binary);
    exists = static_cast<bool>(in);
    std::ostringstream text;
    text << in.rdbuf();
    return text.str();
}

// "same", "differs" or "none" (neither file is there), read in blocks: this process must stay
// small, since a child's peak resident size starts from its parent's size at the fork.
std::string CompareFiles(const std::string& first, const std::string& second) {
    std::ifstream a(first, std::ios::binary), b(second, std::ios::binary);
    if (!a && !b) return "none";
    if (!a || !b) return "differs";
    std::vector<char> blockA(1 << 16), blockB(1 << 16);
    for (;;) {
        a.read(blockA.data(), static_cast<std::streamsize>(blockA.size()));
        b.read(blockB.data(), static_cast<std::streamsize>(blockB.size()));
        if (a.gcount() != b.gcount() || !std::equal(blockA.begin(), blockA.begin() + a.gcount(), blockB.begin()))
            return "differs";
        if (a.gcount() == 0) return "same";
    }
}

// Writes the tree in a child process, for the same reason.
bool WriteTreeApart(const TreeShape& shape, const std::string& folder) {
    pid_t child = fork();
    if (child == 0) {
        TreeSummary summary;
        std::string error;
        bool written = WriteGeneratedTree(shape, folder, summary, error);
        if (!written) std::fprintf(stderr, "verrant-bench: %s\n", error.c_str());
        std::fflush(stderr);
        _exit(written ? 0 : 2);
    }
    int status = 0;
    return child > 0 && waitpid(child, &status, 0) == child && WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

std::set<std::string> CliCommands(const std::string& cli) {
    std::set<std::string> commands;
    std::FILE* help = popen(("'" + cli + "' --help 2>&1").c_str(), "r");
    if (!help) return commands;
    char line[512];
    bool listing = false;
    while (std::fgets(line, sizeof line, help)) {
        std::string text = line;
        if (text.rfind("commands:", 0) == 0) {
            listing = true;
        } else if (listing && text.rfind("  ", 0) == 0 && text.size() > 2 && text[2] != ' ') {
            commands.insert(text.substr(2, text.find(' ', 2) - 2));
        } else {
            listing = false;
        }
    }
    pclose(help);
    return commands;
}

std::vector<std::string> Words(const std::string& text, const Places& places) {
    std::vector<std::string> words;
    std::istringstream in(text);
    for (std::string word; in >> word;) words.push_back(word == "{map}" ? places.mapFile : word);
    return words;
}

std::string Seconds(const Measure& measure) {
    if (!measure.ran) return "-";
    char text[32];
    std::snprintf(text, sizeof text, measure.seconds < 10 ? "%.3f s" : "%.1f s", measure.seconds);
    return text;
}

std::string Ratio(double value) {
    char text[32];
    std::snprintf(text, sizeof text, value < 10 ? "%.2fx" : "%.0fx", value);
    return text;
}

std::string Megabytes(long kb) {
    char text[32];
    std::snprintf(text, sizeof text, "%.1f MB", kb / 1024.0);
    return text;
}

void PrintRow(const std::vector<std::string>& cells) {
    const int widths[] = {26, 9, 16, 9, 8, 8, 10, 10, 10, 8};
    std::string line;
    for (std::size_t i = 0; i < cells.size(); ++i) {
        std::string cell = cells[i];
        int width = widths[i];
        if (i == 0 || i == 2) cell.resize(std::max<std::size_t>(cell.size(), width), ' ');
        else cell.insert(0, cell.size() < static_cast<std::size_t>(width) ? width - cell.size() : 0, ' ');
        line += cell + (i + 1 < cells.size() ? "  " : "");
    }
    std::printf("%s\n", line.c_str());
    std::fflush(stdout);
}

bool ParseOptions(int argc, char** argv, BenchOptions& options, std::string& error) {
    for (int i = 1; i < argc; ++i) {
        std::string option = argv[i];
        if (i + 1 >= argc) {
            error = option + " needs a value";
            return false;
        }
        std::string value = argv[++i];
        auto number = [&]() { return std::strtoll(value.c_str(), nullptr, 10); };
        if (option == "--tree") options.tree = value;
        else if (option == "--cli") options.cli = value;
        else if (option == "--only") options.only = value;
        else if (option == "--runs") options.runs = std::max(1, static_cast<int>(number()));
        else if (option == "--seed") options.shape.seed = static_cast<std::uint64_t>(number());
        else if (option == "--objects") options.shape.objects = static_cast<int>(number());
        else if (option == "--mods") options.shape.mods = static_cast<int>(number());
        else if (option == "--maps") options.shape.maps = std::max(1, static_cast<int>(number()));
        else if (option == "--map-names") options.shape.mapNames = static_cast<int>(number());
        else if (option == "--lines") options.shape.lines = number();
        else {
            error = "unknown option " + option;
            return false;
        }
    }
    return true;
}

// The baseline side of a run: verrant-bench --baseline NAME CATALOGUE MODS MAP REPORTS.
int RunBaselineChild(int argc, char** argv) {
    if (argc != 7) return 2;
    BaselineInput input{argv[3], argv[4], argv[5], argv[6]};
    return RunBaseline(argv[2], input) ? 0 : 2;
}

}  // namespace

int main(int argc, char** argv) {
    if (argc > 1 && std::string(argv[1]) == "--baseline") return RunBaselineChild(argc, argv);
    Self = fs::canonical("/proc/self/exe").string();
    BenchOptions options;
    std::string error;
    if (!ParseOptions(argc, argv, options, error)) {
        std::fprintf(stderr,
                     "verrant-bench: %s\nusage: verrant-bench [--tree DIR] [--cli PATH] [--runs N] [--only COMMAND]\n"
                     "       [--seed N] [--objects N] [--mods N] [--maps N] [--map-names N] [--lines N]\n",
                     error.c_str());
        return 2;
    }

    bool current = false;
    std::string marker = ReadWhole(options.tree + "/gen-tree.txt", current);
    if (!current || marker != TreeShapeText(options.shape)) {
        std::printf("writing the tree into %s ...\n", options.tree.c_str());
        std::fflush(stdout);
        if (!WriteTreeApart(options.shape, options.tree)) return 2;
    }
    Places places;
    places.modsRoot = fs::absolute(options.tree + "/mods").string();
    places.catalogueFolder = places.modsRoot + "/std/com/maddox/il2/objects";
    places.mapFile = places.modsRoot + "/mapmods/maps/Map1/actors.static";
    // Per run, so two benchmarks on one tree do not empty each other's folders.
    places.scratch = fs::absolute(options.tree + "/bench-scratch-" + std::to_string(getpid())).string();
    places.commandReports = places.scratch + "/command";
    places.baselineReports = places.scratch + "/baseline";
    places.copyFolder = places.scratch + "/catalogue";
    std::string catalogue = places.catalogueFolder + "/static.ini";
    long catalogueKb = static_cast<long>(fs::file_size(catalogue) / 1024);

    std::set<std::string> commands = CliCommands(options.cli);
    std::printf("tree %s: %d objects, %d mods, %d maps of %d names; static.ini %s\n", options.tree.c_str(),
                options.shape.objects, options.shape.mods, options.shape.maps, options.shape.mapNames,
                Megabytes(catalogueKb).c_str());
    std::printf("verrant-cli %s; processor time (user + system), best of %d runs (runs over %.0f s are not "
                "repeated)\n\n",
                options.cli.c_str(),
                options.runs, options.repeatLimit);

    auto baselineWords = [&](const char* name, const std::string& catalogueFolder) {
        return std::vector<std::string>{Self, "--baseline", name, catalogueFolder, places.modsRoot, places.mapFile,
                                        places.baselineReports};
    };
    Measure floor = Best(options, [&] { FreshFolder(places.baselineReports); },
                         baselineWords("floor", places.catalogueFolder));
    PrintRow({"command", "time", "baseline", "time", "ratio", "/floor", "peak RSS", "/catalogue", "base RSS", "output"});
    PrintRow({"(read, count lines)", Seconds(floor), "floor", Seconds(floor), "", Ratio(1), Megabytes(floor.peakKb),
              Ratio(static_cast<double>(floor.peakKb) / catalogueKb), "", ""});
    // The mesh search cannot do with less than one listing of every folder of the mods tree.
    Measure listing = Best(options, [] {}, baselineWords("listing-floor", places.catalogueFolder));
    PrintRow({"(list every folder)", Seconds(listing), "listing-floor", Seconds(listing), "",
              Ratio(listing.seconds / std::max(floor.seconds, 1e-6)), Megabytes(listing.peakKb), "", "", ""});
    // A mesh counts as found only once it opens, so the search cannot do with less than that either.
    Measure opening = Best(options, [] {}, baselineWords("open-floor", places.catalogueFolder));
    PrintRow({"(list, open every file)", Seconds(opening), "open-floor", Seconds(opening), "",
              Ratio(opening.seconds / std::max(floor.seconds, 1e-6)), Megabytes(opening.peakKb), "", "", ""});

    std::map<std::string, Measure> measured;  // command rows timed so far, by their command
    std::function<Measure(const BenchRow&)> measureCommand;
    // The sum of the single commands check-all runs, each timed alone; the peak is the highest.
    auto singlesSum = [&] {
        Measure sum;
        sum.ran = true;
        sum.status = 0;
        for (const char* part : CheckAllParts) {
            for (const BenchRow& row : Rows)
                if (row.command == std::string(part) && !measured.count(part)) measured[part] = measureCommand(row);
            sum.seconds += measured[part].seconds;
            sum.peakKb = std::max(sum.peakKb, measured[part].peakKb);
            if (measured[part].status < 0 || measured[part].status > 1) sum.status = measured[part].status;
        }
        return sum;
    };
    for (const BenchRow& row : Rows) {
        if (!options.only.empty() && options.only != row.command) continue;
        if (!commands.count(Words(row.command, places).front())) {
            PrintRow({row.command, "-", row.baseline, "-", "", "", "", "", "", "no such command"});
            continue;
        }
        std::string folder = row.rewritesCatalogue ? places.copyFolder : places.catalogueFolder;
        auto prepare = [&](const std::string& reports) {
            return [&, reports] {
                FreshFolder(reports);
                if (row.rewritesCatalogue) {
                    FreshFolder(places.copyFolder);
                    fs::copy_file(catalogue, places.copyFolder + "/static.ini");
                }
            };
        };
        measureCommand = [&](const BenchRow& timed) {
            std::vector<std::string> words = {options.cli};
            for (const std::string& word : Words(timed.command, places)) words.push_back(word);
            for (const std::string& word : {std::string("--catalogue"), folder, std::string("--report-dir"),
                                            places.commandReports})
                words.push_back(word);
            for (const std::string& word : Words(timed.extraWords, places)) words.push_back(word);
            return Best(options, prepare(places.commandReports), words);
        };
        Measure command = measured[row.command] = measureCommand(row);
        // A rewritten catalogue is kept aside before the baseline's runs replace it.
        std::string compared = row.compared;
        auto output = [&](const std::string& reports) {
            return compared == "@static.ini" ? reports + "/static.ini" : reports + "/" + compared;
        };
        if (compared == "@static.ini") fs::copy_file(places.copyFolder + "/static.ini", output(places.commandReports));
        Measure baseline = row.baseline == std::string("@singles")
                               ? singlesSum()
                               : Best(options, prepare(places.baselineReports), baselineWords(row.baseline, folder));
        if (compared == "@static.ini") fs::copy_file(places.copyFolder + "/static.ini", output(places.baselineReports));
        std::string verdict =
            compared.empty() ? "" : CompareFiles(output(places.commandReports), output(places.baselineReports));
        if (command.status < 0 || command.status > 1) verdict = "exit " + std::to_string(command.status);
        if (baseline.status != 0) verdict += " (baseline failed)";
        if (row.searchesMeshes)
            verdict += "  " + Ratio(command.seconds / std::max(listing.seconds, 1e-6)) + " the listing, " +
                       Ratio(command.seconds / std::max(opening.seconds, 1e-6)) + " with opens";
        PrintRow({row.command, Seconds(command), row.baseline[0] == '@' ? "single commands" : row.baseline, Seconds(baseline),
                  Ratio(baseline.seconds / std::max(command.seconds, 1e-6)),
                  Ratio(command.seconds / std::max(floor.seconds, 1e-6)), Megabytes(command.peakKb),
                  Ratio(static_cast<double>(command.peakKb) / catalogueKb), Megabytes(baseline.peakKb), verdict});
    }
    std::error_code ignored;
    fs::remove_all(places.scratch, ignored);
    return 0;
}
