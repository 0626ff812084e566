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
