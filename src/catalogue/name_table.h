// Names looked up by the hundred thousand: one flat array of slots instead of a node per name.
#pragma once

#include "catalogue/catalogue_reader.h"

#include <functional>
#include <string>
#include <string_view>
#include <vector>

struct NameTable {
    std::vector<int> slots;  // -1 where free, else an index into the names the table serves
    std::size_t mask = 0;
};

// A table with room for count names.
NameTable NameTableFor(std::size_t count);
// The slot for the name: it holds the index of an equal name among names, or -1 when no such name
// has been put in yet; the caller puts one in by setting it.
int& NameSlot(NameTable& table, const std::vector<std::string_view>& names, std::string_view name);
// A table of the names, each slot holding the first place of its name.
NameTable FirstPlaces(const std::vector<std::string_view>& names);

// How many names a check holds at once: a catalogue with more is read again for the rest, so that
// its memory stays within these, however many objects the catalogue has.
struct NameWindow {
    std::size_t nameBytes = 16 << 20;
    std::size_t names = 1 << 20;
};

// Opens a fresh pass over the catalogue's lines; false when it does not open.
using CataloguePass = std::function<bool(LineReader&)>;

// Names held in one block reserved up front, so that the views into it stay valid.
struct HeldNames {
    explicit HeldNames(NameWindow window);
    NameWindow limits;
    std::string bytes;
    std::vector<std::string_view> names;
};
// Adds the name at the end; false, with nothing added, when it would pass a limit. An empty window
// takes any name, however long.
bool HoldName(HeldNames& held, std::string_view name);
// Reads on over the given number of building headers; false when the catalogue ends first.
bool SkipBuildingHeaders(LineReader& catalogue, long long count);
