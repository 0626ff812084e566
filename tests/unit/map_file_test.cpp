#include "maps/map_file.h"

#include "map_records.h"
#include "platform/headless/headless.h"
#include "test_support.h"

namespace {

// A literal's bytes, NULs included, less the terminating one.
template <std::size_t N>
std::string Bytes(const char (&text)[N]) {
    return std::string(text, N - 1);
}

}  // namespace

TEST(MapFile, ByteTables) {
    EXPECT_EQ(MapTextOf(Bytes("a\0b\0\0")), "a b  ");
    EXPECT_EQ(MapTextOf("\x01x\ty\r\nz\x1f \x20!\"0AZaz_$."), "xyz!\"0AZaz_$.");
    EXPECT_EQ(MapTextOf("z{|}~\x7f\x80\xc4\xff!"), "z!");
    EXPECT_EQ(ValidationTextOf(Bytes("\0a\x01 b\t\r\nc\x20")), "abc");
    EXPECT_EQ(ValidationTextOf("{|}~\x7f\x80\xff!"), "{|}~\x7f\x80\xff!");
}

TEST(MapFile, NamesRunFromBuildToTheNextBlank) {
    struct Case {
        std::string bytes;
        Strings names;
    };
    const Case cases[] = {
        {"", {}},
        {Bytes("\x05\0com.maddox.il2.objects.buildings.House$Kiosk\0\x01"), {"buildings.House$Kiosk"}},
        {Bytes("buildA\0buildB\0buildA\0"), {"buildA", "buildB", "buildA"}},
        {Bytes("buildings.House$Rebuild\0buildings.House$Rebuilding\0"),
         {"buildings.House$Rebuild", "buildings.House$Rebuilding"}},
        {Bytes("xxbuildA\0build\0\0build\0"), {"buildA", "build", "build"}},
        {Bytes("Buildings.House$A\0BUILD\0bUild\0buildings.House$a\0"), {"buildings.House$a"}},
        {Bytes("buil\tdings.Hou\r\nse$\xe4\x41 b{|}~\0"), {"buildings.House$Ab"}},
        // A last "build" that no blank ends may be cut short by the window: no name, scan over.
        {Bytes("buildA\0buildB"), {"buildA"}},
        {Bytes("buildA\0build"), {"buildA"}},
    };
    for (const Case& c : cases) EXPECT_EQ(ExtractMapObjectNames(MapTextOf(c.bytes)), c.names) << c.bytes;
}

class MapFileReadingTest : public ScratchTest {
protected:
    bool IsMap(const std::string& name, const std::string& bytes) {
        Write("maps/" + name, bytes);
        return IsMapFile(Folder("maps"), name);
    }
    Strings Names(const std::string& name, const std::string& bytes) {
        Write("maps/" + name, bytes);
        return ExtractMapObjectNames(ReadMapFileText(Folder("maps"), name));
    }
};

TEST_F(MapFileReadingTest, MarkerMustStandInTheFirst50000Bytes) {
    const std::string marker = "com.maddox.il2.objects";
    EXPECT_TRUE(IsMap("inside", std::string(50000 - marker.size(), 'x') + marker));
    EXPECT_FALSE(IsMap("outside", std::string(50001 - marker.size(), 'x') + marker));
    // Blanks count against the byte limit although they vanish from the text.
    EXPECT_FALSE(IsMap("blanks", std::string(49990, ' ') + marker));
    EXPECT_TRUE(IsMap("broken", Bytes("x\0com.maddox\0.\r\nil2 .objects\tz")));
    EXPECT_FALSE(IsMap("case", "com.Maddox.il2.objects"));
    EXPECT_FALSE(IsMap("empty", ""));
    EXPECT_FALSE(IsMapFile(Folder("maps"), "absent"));
}

TEST_F(MapFileReadingTest, StaticIniIsRefusedUnreadButOtherCasesAreJudged) {
    const std::string map = MapRecordBytes({BuildingClassName("Kiosk")});
    long long opensBefore = HeadlessCounters().opens;
    EXPECT_FALSE(IsMap("static.ini", map));
    EXPECT_EQ(HeadlessCounters().opens, opensBefore);
    EXPECT_TRUE(IsMap("Static.ini", map));
    EXPECT_TRUE(IsMap("static.INI", map));
}

TEST_F(MapFileReadingTest, MapTextCoversTheFirst140000Bytes) {
    const std::string name = Bytes("buildA\0");
    EXPECT_EQ(Names("inside", std::string(140000 - name.size(), 'x') + name), Strings({"buildA"}));
    EXPECT_EQ(Names("outside", std::string(140001 - name.size(), 'x') + name), Strings{});
    Write("maps/long", std::string(200000, 'y'));
    EXPECT_EQ(ReadMapFileText(Folder("maps"), "long").size(), 140000u);
}

TEST_F(MapFileReadingTest, FileIsReadOnlyInItsOwnFolder) {
    Write("here/actors.static", MapRecordBytes({BuildingClassName("Kiosk")}));
    ASSERT_TRUE(MakeFolderCurrent(Folder("here")));
    EXPECT_FALSE(IsMapFile(Folder("gone"), "actors.static"));
    EXPECT_EQ(ReadMapFileText(Folder("gone"), "actors.static"), "");
}
