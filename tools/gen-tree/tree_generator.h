// A seeded modification tree at modpack scale, for benchmarks and fuzz seeds: a merged catalogue
// with every kind of line the checks tell apart, hundreds of mods with mesh folders, and maps.
#pragma once

#include <cstdint>
#include <string>

struct TreeShape {
    std::uint64_t seed = 1;
    int objects = 100000;    // building headers in the catalogue, doubles and odd families included
    int mods = 300;
    int maps = 1;
    int mapNames = 200000;   // objects each map places
    long long lines = 0;     // catalogue lines to reach with comments, blanks and keys; 0: 20 per object
};

struct TreeSummary {
    long long catalogueLines = 0;
    long long catalogueBytes = 0;
    int doubledHeaders = 0;  // headers that repeat an earlier section name
    int meshFiles = 0;
    int folders = 0;
    long long mapBytes = 0;  // all maps together
};

// The catalogue's bytes alone; the same shape and seed give the same bytes.
std::string GenerateCatalogue(const TreeShape& shape);

// Writes the tree under outFolder: mods/std/com/maddox/il2/objects/static.ini, mods/<mod>/3do/...,
// mods/mapmods/maps/<map>/actors.static, and gen-tree.txt naming the shape. An outFolder that is
// not empty must hold an earlier gen-tree.txt; its mods folder is replaced.
bool WriteGeneratedTree(const TreeShape& shape, const std::string& outFolder, TreeSummary& summary,
                        std::string& error);

// The text gen-tree.txt holds for a shape, so a caller can tell whether a tree is current.
std::string TreeShapeText(const TreeShape& shape);
