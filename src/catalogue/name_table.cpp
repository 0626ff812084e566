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

NameTable FirstPlaces(const std::vector<std::string_view>& names) {
    NameTable table = NameTableFor(names.size());
    for (std::size_t i = 0; i < names.size(); ++i) {
        int& slot = NameSlot(table, names, names[i]);
        if (slot < 0) slot = static_cast<int>(i);
    }
    return table;
}

HeldNames::HeldNames(NameWindow window) : limits(window) { bytes.reserve(limits.nameBytes); }

bool HoldName(HeldNames& held, std::string_view name) {
    bool full = held.names.size() == held.limits.names ||
                held.bytes.size() + name.size() > held.bytes.capacity();
    if (full && !held.names.empty()) return false;
    std::size_t at = held.bytes.size();
    held.bytes.append(name);
    held.names.push_back(std::string_view(held.bytes).substr(at));
    return true;
}

bool SkipBuildingHeaders(LineReader& catalogue, long long count) {
    std::string_view line;
    while (count > 0 && NextCatalogueLine(catalogue, line)) count -= IsBuildingHeader(line);
    return count == 0;
}
