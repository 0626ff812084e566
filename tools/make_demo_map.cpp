// Writes the demo tree's map file: objects the demo catalogue defines, objects it lacks, repeats,
// and objects of other kinds that the map check passes over.
//
//   make-demo-map examples/demo-tree/mods/mapmods/maps/Coast/actors.static
#include "map_records.h"

#include <cstdio>
#include <fstream>

int main(int argc, char** argv) {
    if (argc != 2) {
        std::fprintf(stderr, "usage: make-demo-map OUTPUT\n");
        return 2;
    }
    const std::vector<std::string> classNames = {
        BuildingClassName("Signpost"),
        BuildingClassName("Barn"),
        "com.maddox.il2.objects.vehicles.artillery.Artillery$Flak18_37mm",
        BuildingClassName("Kiosk"),
        BuildingClassName("Granary"),
        BuildingClassName("Barn"),
        BuildingClassName("Sauna"),
        "com.maddox.il2.objects.buildings.Furniture$Bench",
        BuildingClassName("kiosk"),
        "com.maddox.il2.objects.ships.Ship$RwyTransp",
        BuildingClassName("Pier"),
        BuildingClassName("Watchtower"),
        BuildingClassName("Granary"),
        "com.maddox.il2.objects.buildings.Tree$Fir",
        BuildingClassName("Barn"),
    };
    std::string bytes = MapRecordBytes(classNames);
    std::ofstream out(argv[1], std::ios::binary);
    out.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    out.close();
    if (!out) {
        std::fprintf(stderr, "make-demo-map: cannot write %s\n", argv[1]);
        return 2;
    }
    return 0;
}
