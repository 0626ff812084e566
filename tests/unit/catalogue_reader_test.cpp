#include "catalogue/catalogue_reader.h"

#include "test_support.h"

#include <random>

using namespace std::string_literals;

namespace {

Strings Lines(const std::string& bytes, bool trimmed = false) {
    LineReader reader = LinesOf(bytes);
    std::string_view line;
    Strings lines;
    while (trimmed ? NextCatalogueLine(reader, line) : NextPhysicalLine(reader, line))
        lines.emplace_back(line);
    return lines;
}

class FileLinesTest : public ScratchTest {
protected:
    // The lines of the bytes written to a file and read blockSize bytes at a time.
    Strings FileLines(const std::string& bytes, std::size_t blockSize, bool trimmed = false) {
        Write("lines.txt", bytes);
        EXPECT_TRUE(MakeFolderCurrent(Folder("")));
        reader = LinesOfFile(OpenForReading("lines.txt"), blockSize);
        std::string_view line;
        Strings lines;
        while (trimmed ? NextCatalogueLine(reader, line) : NextPhysicalLine(reader, line)) lines.emplace_back(line);
        return lines;
    }
    LineReader reader;
};

}  // namespace

TEST(CatalogueReader, PhysicalLineEnds) {
    const struct {
        std::string bytes;
        Strings lines;
    } cases[] = {{"", {}}, {"a", {"a"}}, {"a\r\nb\r\n", {"a", "b"}}, {"a\rb\nc", {"a", "b", "c"}},
                 {"a\r", {"a"}}, {"\r\n", {""}}, {"a\n\nb\n", {"a", "", "b"}}, {"a\r\r\nb", {"a", "", "b"}},
                 {"a\n\r", {"a", ""}}, {"a\r\rb", {"a", "", "b"}}, {"a\0b\0"s, {"a", "b"}},
                 {"a\r\0b"s, {"a", "", "b"}}, {"\0\0"s, {"", ""}}};
    for (const auto& c : cases) {
        SCOPED_TRACE(testing::PrintToString(c.bytes));
        EXPECT_EQ(Lines(c.bytes), c.lines);
    }
}

TEST(CatalogueReader, CatalogueLinesLoseBlanksButKeepTabs) {
    EXPECT_EQ(Lines("  [buildings.House$A]  \r\n   \r\n\t\r\n \tMesh  x\t \r\n", true),
              Strings({"[buildings.House$A]", "", "\t", "\tMesh  x\t"}));
    EXPECT_EQ(TrimBlanks(" \t a  b \t "), "\t a  b \t");
}

TEST(CatalogueReader, BuildingHeaders) {
    for (const char* line : {"[buildings.House$A]", "[bui", "[buiX]", "[buildings.Tree$B] // x"})
        EXPECT_TRUE(IsBuildingHeader(line)) << line;
    for (const char* line : {"[Buildings.House$A]", "[bu", "\t[bui", " [bui", ""})
        EXPECT_FALSE(IsBuildingHeader(line)) << line;
}

TEST(CatalogueReader, NameCuts) {
    const struct {
        std::string header, bracket, ends, object;
    } cases[] = {
        {"[buildings.House$Kiosk]", "buildings.House$Kiosk", "buildings.House$Kiosk", "Kiosk"},
        {"[buildings.House$Kiosk] //", "buildings.House$Kiosk", "buildings.House$Kiosk] /", "Kiosk] /"},
        {"[buildings.House$Kiosk", "buildings.House$Kiosk", "buildings.House$Kios", "Kios"},
        {"[buildings.House$Ab$Cd]", "buildings.House$Ab$Cd", "buildings.House$Ab$Cd", "A"},
        {"[buildings.House]", "buildings.House", "buildings.House", "[buildings.House"},
        {"[]x]", "", "]x", "[]x"}, {"[b", "b", "", "["}, {"[", "", "", ""}};
    for (const auto& c : cases) {
        SCOPED_TRACE(c.header);
        EXPECT_EQ(SectionNameByBracket(c.header), c.bracket);
        EXPECT_EQ(SectionNameByEnds(c.header), c.ends);
        EXPECT_EQ(ObjectNameOf(c.header), c.object);
    }
}

TEST(CatalogueReader, SectionNamesOfTrimmedBuildingHeadersInFileOrder) {
    const std::string catalogue =
        "// [buildings.House$Comment]\r\n  [buildings.House$B] // moved\n\t[buildings.House$Tab]\r"
        "[Buildings.House$C]\r\n[buildings.Plate$A]\r\n[bui";
    LineReader lines = LinesOf(catalogue);
    Strings names;
    ForEachBuildingSectionName(lines, [&names](std::string_view name) { names.emplace_back(name); });
    EXPECT_EQ(names, Strings({"buildings.House$B", "buildings.Plate$A", "bui"}));
}

// Wherever the blocks cut the bytes (inside a CR LF, a long line, a run of blanks), a file gives the
// lines the same bytes give in memory.
TEST_F(FileLinesTest, BlocksCutLinesAnywhere) {
    std::mt19937 random(5);
    const char alphabet[] = {'a', 'b', ' ', '\r', '\n', '\0'};
    for (int round = 0; round < 300; ++round) {
        std::string bytes(random() % 40, 'a');
        for (char& c : bytes) c = alphabet[random() % 6];
        if (round % 10 == 0) bytes.insert(random() % (bytes.size() + 1), std::string(300, 'x') + "\r");
        std::size_t blockSize = 1 + random() % 7;
        SCOPED_TRACE(testing::PrintToString(bytes) + " in blocks of " + std::to_string(blockSize));
        EXPECT_EQ(FileLines(bytes, blockSize), Lines(bytes));
        EXPECT_EQ(FileLines(bytes, blockSize, true), Lines(bytes, true));
        EXPECT_FALSE(reader.ReadFailed());
    }
}

TEST_F(FileLinesTest, LookingAheadTakesNoLine) {
    Write("lines.txt", "ab\r\ncd\ref");
    ASSERT_TRUE(MakeFolderCurrent(Folder("")));
    reader = LinesOfFile(OpenForReading("lines.txt"), 2);
    EXPECT_TRUE(reader.Ahead(5).starts_with("ab\r\nc"));
    EXPECT_EQ(reader.Ahead(100), "ab\r\ncd\ref");
    std::string_view line;
    Strings lines;
    while (NextPhysicalLine(reader, line)) lines.emplace_back(line);
    EXPECT_EQ(lines, Strings({"ab", "cd", "ef"}));
}

TEST_F(FileLinesTest, AFailedReadEndsTheLinesAndIsTold) {
    HeadlessFileFaults faults;
    faults.failReadName = "lines.txt";
    faults.failReadAfterBytes = 8;
    HeadlessSetFileFaults(faults);
    EXPECT_EQ(FileLines("line 1\nline 2\nline 3\n", 3), Strings({"line 1", "l"}));
    EXPECT_TRUE(reader.ReadFailed());
}
