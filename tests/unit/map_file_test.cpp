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

Strings NamesIn(const std::string& fileBytes) { return ExtractMapObjectNames(MapTextOf(fileBytes)); }

}  // namespace

TEST(MapFile, MapTextByteTable) {
    EXPECT_EQ(MapTextOf(Bytes("a\0b\0\0")), "a b  ");
    EXPECT_EQ(MapTextOf("\x01x\ty\r\nz\x1f \x20!"), "xyz!");
    EXPECT_EQ(MapTextOf("z{|}~\x7f\x80\xc4\xff!"), "z!");
    EXPECT_EQ(MapTextOf("\"0AZaz_$."), "\"0AZaz_$.");
    std::string everyByte;
    for (int value = 0; value < 256; ++value) everyByte += static_cast<char>(value);
    std::string text = MapTextOf(everyByte);
    ASSERT_EQ(text.size(), 1u + 90u);
    EXPECT_EQ(text.front(), ' ');
    EXPECT_EQ(text[1], '!');
    EXPECT_EQ(text.back(), 'z');
}

TEST(MapFile, ValidationTextDropsOnlyBlanksAndControlBytes) {
    EXPECT_EQ(ValidationTextOf(Bytes("\0a\x01 b\t\r\nc\x20")), "abc");
    EXPECT_EQ(ValidationTextOf("{|}~\x7f\x80\xff!"), "{|}~\x7f\x80\xff!");
}

TEST(MapFile, NamesRunFromBuildToTheNextBlank) {
    struct Case {
        std::string text;
        Strings names;
    };
    const Case cases[] = {
        {"", {}},
        {"com.maddox.il2.objects.buildings.House$Kiosk x", {"buildings.House$Kiosk"}},
        {"buildA buildB buildA ", {"buildA", "buildB", "buildA"}},
        {"buildings.House$Rebuild buildings.House$Rebuilding ",
         {"buildings.House$Rebuild", "buildings.House$Rebuilding"}},
        {"xxbuildA yy", {"buildA"}},
        {"build  build ", {"build", "build"}},
        {"Buildings.House$A buildings.House$a ", {"buildings.House$a"}},
        {"BUILD Build bUild ", {}},
        // A last "build" that no blank ends may be cut short by the window: no name, scan over.
        {"buildA buildB", {"buildA"}},
        {"buildA build", {"buildA"}},
    };
    for (const Case& c : cases) EXPECT_EQ(ExtractMapObjectNames(c.text), c.names) << c.text;
}

TEST(MapFile, NamesFromFileBytes) {
    EXPECT_EQ(NamesIn(Bytes("\x05\0buil\tdings.House$A\0\x01\x02")), Strings({"buildings.House$A"}));
    EXPECT_EQ(NamesIn(Bytes("buildings.House$A\0B\0")), Strings({"buildings.House$A"}));
    EXPECT_EQ(NamesIn(Bytes("buildings.Hou\r\nse$\xe4\x41 b\0")), Strings({"buildings.House$Ab"}));
    EXPECT_EQ(NamesIn(Bytes("bu{il}d~ing\0")), Strings({"building"}));
    EXPECT_EQ(NamesIn(Bytes("buildA\0buildA\0")), Strings({"buildA", "buildA"}));
}

TEST(MapFile, SplitsSelectionAtTheFirstStar) {
    auto split = [](const std::string& selection) {
        std::string folder, fileName;
        SplitMapFileSelection(selection, folder, fileName);
        return Strings({folder, fileName});
    };
    EXPECT_EQ(split("C:\\maps\\*actors.static"), Strings({"C:\\maps\\", "actors.static"}));
    EXPECT_EQ(split("C:\\maps\\*"), Strings({"C:\\maps\\", ""}));
    EXPECT_EQ(split("C:\\a*b\\*c"), Strings({"C:\\a", "b\\*c"}));
    EXPECT_EQ(split(""), Strings({"", ""}));
    EXPECT_EQ(split("C:\\maps\\"), Strings({"C:\\maps\\", ""}));
}

class MapFileReadingTest : public ScratchTest {
protected:
    bool IsMap(const std::string& name, const std::string& bytes) {
        Write("maps/" + name, bytes);
        return IsMapFile(Folder("maps"), name);
    }
};

TEST_F(MapFileReadingTest, MarkerMustStandInTheFirst50000Bytes) {
    const std::string marker = "com.maddox.il2.objects";
    EXPECT_TRUE(IsMap("inside", std::string(50000 - marker.size(), 'x') + marker));
    EXPECT_FALSE(IsMap("outside", std::string(50001 - marker.size(), 'x') + marker));
    // Blanks count against the byte limit although they vanish from the text.
    EXPECT_FALSE(IsMap("blanks", std::string(49990, ' ') + marker));
    EXPECT_TRUE(IsMap("broken", Bytes("x\0com.maddox.\r\nil2 .objects\tz")));
    EXPECT_TRUE(IsMap("split", Bytes("com.maddox\0.il2.objects")));
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

TEST_F(MapFileReadingTest, FileIsReadOnlyInItsOwnFolder) {
    Write("here/actors.static", MapRecordBytes({BuildingClassName("Kiosk")}));
    ASSERT_TRUE(MakeFolderCurrent(Folder("here")));
    EXPECT_FALSE(IsMapFile(Folder("gone"), "actors.static"));
    EXPECT_EQ(ReadMapFileText(Folder("gone"), "actors.static"), "");
}

TEST_F(MapFileReadingTest, MapTextCoversTheFirst140000Bytes) {
    const std::string name = Bytes("buildA\0");
    Write("maps/inside", std::string(140000 - name.size(), 'x') + name);
    Write("maps/outside", std::string(140001 - name.size(), 'x') + name);
    Write("maps/long", std::string(200000, 'y'));
    EXPECT_EQ(ExtractMapObjectNames(ReadMapFileText(Folder("maps"), "inside")), Strings({"buildA"}));
    EXPECT_EQ(ExtractMapObjectNames(ReadMapFileText(Folder("maps"), "outside")), Strings{});
    EXPECT_EQ(ReadMapFileText(Folder("maps"), "long").size(), 140000u);
    EXPECT_EQ(ReadMapFileText(Folder("maps"), "absent"), "");
}
