// gen-tree: writes a seeded modification tree of a given scale for benchmarks and fuzz seeds.
#include "tree_generator.h"

#include <cstdio>
#include <cstdlib>
#include <string>

namespace {

void PrintUsage(std::FILE* to) {
    std::fprintf(to,
                 "usage: gen-tree --out DIR [--seed N] [--objects N] [--mods N] [--maps N] [--map-names N]\n"
                 "                [--lines N]\n"
                 "  --out DIR        the tree's root; must be empty or an earlier gen-tree output\n"
                 "  --seed N         same seed and sizes, same bytes (default 1)\n"
                 "  --objects N      building headers in static.ini (default 100000)\n"
                 "  --mods N         mods under mods/ (default 300)\n"
                 "  --maps N         maps with an actors.static (default 1)\n"
                 "  --map-names N    objects each map places (default 200000)\n"
                 "  --lines N        catalogue lines to reach (default 20 per object)\n");
}

bool ParseCount(const char* text, long long& value) {
    char* end = nullptr;
    value = std::strtoll(text, &end, 10);
    return end != text && *end == '\0' && value >= 0;
}

}  // namespace

int main(int argc, char** argv) {
    TreeShape shape;
    std::string out;
    for (int i = 1; i < argc; ++i) {
        std::string option = argv[i];
        if (option == "--help" || option == "-h") {
            PrintUsage(stdout);
            return 0;
        }
        long long value = 0;
        if (i + 1 >= argc || (option != "--out" && !ParseCount(argv[i + 1], value))) {
            std::fprintf(stderr, "gen-tree: %s needs a %s\n", option.c_str(), option == "--out" ? "folder" : "number");
            PrintUsage(stderr);
            return 2;
        }
        ++i;
        if (option == "--out") out = argv[i];
        else if (option == "--seed") shape.seed = static_cast<std::uint64_t>(value);
        else if (option == "--objects") shape.objects = static_cast<int>(value);
        else if (option == "--mods") shape.mods = static_cast<int>(value);
        else if (option == "--maps") shape.maps = static_cast<int>(value);
        else if (option == "--map-names") shape.mapNames = static_cast<int>(value);
        else if (option == "--lines") shape.lines = value;
        else {
            std::fprintf(stderr, "gen-tree: unknown option %s\n", option.c_str());
            PrintUsage(stderr);
            return 2;
        }
    }
    if (out.empty()) {
        std::fprintf(stderr, "gen-tree: --out DIR is required\n");
        PrintUsage(stderr);
        return 2;
    }
    TreeSummary summary;
    std::string error;
    if (!WriteGeneratedTree(shape, out, summary, error)) {
        std::fprintf(stderr, "gen-tree: %s\n", error.c_str());
        return 2;
    }
    std::printf("static.ini: %lld lines, %lld bytes, %d doubled headers\n", summary.catalogueLines,
                summary.catalogueBytes, summary.doubledHeaders);
    std::printf("mesh files: %d in %d folders; maps: %d, %lld bytes\n", summary.meshFiles, summary.folders, shape.maps,
                summary.mapBytes);
    return 0;
}
