#include "catalogue/name_table.h"

#include <functional>

NameTable NameTableFor(std::size_t count) {
    std::size_t size = 16;
    while (size < 2 * count) size *= 2;
    return {std::vector<int>(size, -1), size - 1};
}

// Open addressing with linear probing: at most half the slots are taken, so runs stay short.
int& NameSlot(NameTable& table, const std::vector<std::string_view>& names, std::string_view name) {
    std::size_t place = std::hash<std::string_view>{}(name) & table.mask;
    while (table.slots[place] >= 0 && names[table.slots[place]] != name) place = (place + 1) & table.mask;
    return table.slots[place];
}

void ReadSectionNames(LineReader& catalogue, SectionNames& sections) {
    std::vector<std::size_t> ends;
    ForEachBuildingSectionName(catalogue, [&](std::string_view name) {
        sections.bytes.append(name);
        ends.push_back(sections.bytes.size());
    });
    sections.names.clear();
    sections.names.reserve(ends.size());
    std::size_t start = 0;
    for (std::size_t end : ends) {
        sections.names.push_back(std::string_view(sections.bytes).substr(start, end - start));
        start = end;
    }
}
