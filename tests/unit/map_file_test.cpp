#include "maps/map_file.h"
#include "maps/missing_map_objects.h"

#include "map_records.h"
#include "maps/all_maps.h"
#include "output/app_state.h"
#include "output/progress_list.h"
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

class AllMapsTest : public ScratchTest {};

// However few catalogue names a window holds, every map gets the findings of the whole catalogue.
TEST_F(AllMapsTest, SmallWindowsFindWhatOneWindowFinds) {
    UseCatalogue("[***]\r\nTitle A\r\n[buildings.House$A]\r\n[buildings.House$B]\r\n[buildings.House$A]\r\n"
                 "[buildings.House$C]\r\n[buildings.House$D]\r\n");
    const std::string maps = "mods/mapmods/maps/";
    Write(maps + "Coast/actors.static", MapRecordBytes({BuildingClassName("A"), BuildingClassName("X"),
                                                        BuildingClassName("D"), BuildingClassName("X")}));
    Write(maps + "Hills/actors.static", MapRecordBytes({BuildingClassName("Y"), BuildingClassName("C")}));
    Write(maps + "Plain/actors.static", MapRecordBytes({BuildingClassName("B")}));
    Write(maps + "Junk/actors.static", "no map");
    ProgressListOn = true;
    OpenProgressList();
    auto run = [&](NameWindow window) {
        AllMapsCount count;
        EXPECT_EQ(CheckAllMaps(CatalogueFolder, Folder(maps), count, window), CommandResult::Findings);
        EXPECT_EQ(AllMapsSummary(count), "3 maps checked, 2 with missing objects, 2 names missing, 1 not map files");
        return Desktop("Missing_objects_all_maps.txt") + "|" + CrLf(ProgressLines());
    };
    const std::string whole = run(NameWindow());
    EXPECT_NE(whole.find("Map: Coast\\actors.static\r\nbuildings.House$X\r\n\r\nMap: Hills"), std::string::npos);
    for (std::size_t names : {1, 2, 3}) EXPECT_EQ(run({1 << 20, names}), whole) << names << " names a window";
}
