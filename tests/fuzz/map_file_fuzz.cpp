// A map file and a catalogue from arbitrary bytes: the map test against its byte rule, and the
// missing map objects report against the linear walk of the section names.
#include "fuzz_support.h"

#include "maps/map_file.h"
#include "maps/missing_map_objects.h"

namespace {

// "com.maddox.il2.objects" among the first 50,000 bytes once every byte of 0 to 32 is gone.
bool HoldsMapMarker(const std::string& bytes) {
    std::string text;
    for (std::size_t i = 0; i < bytes.size() && i < 50000; ++i)
        if (static_cast<unsigned char>(bytes[i]) > 32) text += bytes[i];
    return text.find("com.maddox.il2.objects") != std::string::npos;
}

}  // namespace

// The input: two bytes giving the map's length (little end first), the map, then the catalogue.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    if (size < 2) return 0;
    std::size_t mapLength = std::min<std::size_t>(data[0] | data[1] << 8, size - 2);
    std::string map(reinterpret_cast<const char*>(data) + 2, mapLength);
    std::string catalogue(reinterpret_cast<const char*>(data) + 2 + mapLength, size - 2 - mapLength);
    ResetForInput();
    WriteScratchFile("map/actors.static", map);
    WriteScratchFile("static.ini", catalogue);

    Require(IsMapFile(ScratchFolder() + "map\\", "actors.static") == HoldsMapMarker(map), "the map file test");
    CommandResult result = FindMissingMapObjects(ScratchFolder() + "map\\*actors.static", ScratchFolder());
    bool written = false, expected = false;
    std::string report = ReadDesktopFile("Missing_objects.txt", written);
    std::string walked = BaselineOutput("linear-walk", "Missing_objects.txt", expected);
    Require(written == expected && report == walked, "the report is the linear walk's");
    Require(result == (written ? CommandResult::Findings : CommandResult::NothingFound), "the result");
    return 0;
}
