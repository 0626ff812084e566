// Names looked up by the hundred thousand: one flat array of slots instead of a node per name.
#pragma once

#include "catalogue/catalogue_reader.h"

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

// The section names of a catalogue's building headers, in file order, held in one block.
struct SectionNames {
    std::string bytes;
    std::vector<std::string_view> names;  // views into bytes
};
// Reads them by the bracket cut.
void ReadSectionNames(LineReader& catalogue, SectionNames& sections);
