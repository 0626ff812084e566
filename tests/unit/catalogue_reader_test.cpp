#include "catalogue/catalogue_reader.h"

#include "test_support.h"

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
    std::vector<std::string_view> expected = {"buildings.House$B", "buildings.Plate$A", "bui"};
    EXPECT_EQ(BuildingSectionNames(catalogue), expected);
}
