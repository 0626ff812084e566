#include "maps/map_file.h"
#include "maps/missing_map_objects.h"

#include "test_support.h"

using namespace std::string_literals;

TEST(MapFile, ByteTables) {
    EXPECT_EQ(MapTextOf("a\0b\0\0"s), "a b  ");
    EXPECT_EQ(MapTextOf("\x01x\ty\r\nz\x1f \x20!\"0AZaz_$."), "xyz!\"0AZaz_$.");
    EXPECT_EQ(MapTextOf("z{|}~\x7f\x80\xc4\xff!"), "z!");
    EXPECT_EQ(ValidationTextOf("\0a\x01 b\t\r\nc\x20!"s), "abc!");
    EXPECT_EQ(ValidationTextOf("{|}~\x7f\x80\xff"), "{|}~\x7f\x80\xff");
}

TEST(MapFile, NamesRunFromBuildToTheNextBlank) {
    const struct {
        std::string bytes;
        Strings names;
    } cases[] = {{"", {}},
                 {"\x05\0com.maddox.il2.objects.buildings.House$Kiosk\0\x01"s, {"buildings.House$Kiosk"}},
                 {"buildA\0buildB\0buildA\0"s, {"buildA", "buildB", "buildA"}},
                 {"buildings.House$Rebuild\0"s, {"buildings.House$Rebuild"}},
                 {"xxbuildA\0build\0\0build\0"s, {"buildA", "build", "build"}},
                 {"Buildings.House$A\0BUILD\0bUild\0buildings.House$a\0"s, {"buildings.House$a"}},
                 {"buil\tdings.Hou\r\nse$\xe4\x41 b{|}~\0"s, {"buildings.House$Ab"}}};
    for (const auto& c : cases) {
        SCOPED_TRACE(testing::PrintToString(c.bytes));
        EXPECT_EQ(ExtractMapObjectNames(MapTextOf(c.bytes)), c.names);
    }
}

TEST(MapFile, SelectionSplitsAtItsFirstStar) {
    const struct {
        std::string selection, folder, fileName;
    } cases[] = {{"C:\\m\\*actors.static", "C:\\m\\", "actors.static"}, {"C:\\m\\*", "C:\\m\\", ""},
                 {"*a*b", "", "a*b"}, {"C:\\m\\", "C:\\m\\", ""}, {"", "", ""}};
    for (const auto& c : cases) {
        std::string folder = "old", fileName = "old";
        SplitMapFileSelection(c.selection, folder, fileName);
        EXPECT_EQ(folder, c.folder) << c.selection;
        EXPECT_EQ(fileName, c.fileName) << c.selection;
    }
}

TEST(MapFile, FirstOrdinalOfEachNameCountsFromZero) {
    auto ordinals = [](const Strings& mapNames, const std::string& catalogue) {
        LineReader lines = LinesOf(catalogue);
        return FirstSectionOrdinals(mapNames, lines);
    };
    EXPECT_EQ(ordinals({"buiA", "buiB", "buia", "buiA", "buiC", "bui", "buiA "},
                       "[buiX]\r\n[buiA]\r\nMesh x\r\n[buiB]\r\n[Bui]\r\n[buiA]\r\n[bui]\r\n[bui A]\r\n"),
              std::vector<int>({1, 2, NotInCatalogue, 1, NotInCatalogue, 4, NotInCatalogue}));
    EXPECT_EQ(ordinals({"buiX"}, "[buiX]"), std::vector<int>({0}));
    EXPECT_EQ(ordinals({"buiA"}, ""), std::vector<int>({NotInCatalogue}));
}
