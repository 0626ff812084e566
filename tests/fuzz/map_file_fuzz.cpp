// A map file and a catalogue from arbitrary bytes: two bytes giving the map's length (little end
// first), the map, then the catalogue. The map file test against its byte rule, and the missing
// map objects report against the linear walk of the section names.
#include "fuzz_support.h"

#include "maps/map_file.h"
#include "maps/missing_map_objects.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    if (size < 2) return 0;
    std::size_t mapLength = std::min<std::size_t>(data[0] | data[1] << 8, size - 2);
    Fresh(data + 2 + mapLength, size - 2 - mapLength);
    std::string map(reinterpret_cast<const char*>(data) + 2, mapLength), shown;
    // The test reads the first 50,000 bytes, the names the first 140,000: some maps begin near either end.
    if (size % 8 < 2) map.insert(0, (size % 8 ? 140000 : 50000) - 1 - size / 8 % 64, ' ');
    WriteFile("map/actors.static", map);
    // A map file holds "com.maddox.il2.objects" in its first 50,000 bytes once those of 0 to 32 are gone.
    for (std::size_t i = 0; i < map.size() && i < 50000; ++i)
        if (static_cast<unsigned char>(map[i]) > 32) shown += map[i];
    Require(IsMapFile(Scratch + "map\\", "actors.static") ==
                (shown.find("com.maddox.il2.objects") != std::string::npos),
            "the map file test");
    RequireBaseline(FindMissingMapObjects(Scratch + "map\\*actors.static", Scratch), "Missing_objects.txt",
                    "linear-walk");
    return 0;
}
