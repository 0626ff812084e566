#include "catalogue/catalogue_reader.h"

#include "test_support.h"

#include <filesystem>

class CatalogueReaderTest : public ScratchTest {
protected:
    Strings Lines(const std::string& bytes, bool trimmed = false) {
        Write("cat/static.ini", bytes);
        CatalogueReader reader;
        EXPECT_TRUE(OpenCatalogue(Folder("cat"), reader));
        Strings lines;
        std::string line;
        while (trimmed ? NextCatalogueLine(reader, line) : NextPhysicalLine(reader, line)) lines.push_back(line);
        CloseCatalogue(reader);
        return lines;
    }
};

TEST_F(CatalogueReaderTest, LineEnds) {
    EXPECT_EQ(Lines(""), Strings{});
    EXPECT_EQ(Lines("a"), Strings({"a"}));
    EXPECT_EQ(Lines("a\r\nb\r\n"), Strings({"a", "b"}));
    EXPECT_EQ(Lines("a\rb\nc"), Strings({"a", "b", "c"}));
    EXPECT_EQ(Lines("a\n\nb\n"), Strings({"a", "", "b"}));
    EXPECT_EQ(Lines("\n"), Strings({""}));
    EXPECT_EQ(Lines("a\r\r\nb"), Strings({"a", "", "b"}));
    EXPECT_EQ(Lines("a\n\r"), Strings({"a", ""}));
    EXPECT_EQ(Lines(std::string("a\0b\0", 4)), Strings({"a", "b"}));
    EXPECT_EQ(Lines(std::string("a\r\0b", 4)), Strings({"a", "", "b"}));
}

TEST_F(CatalogueReaderTest, LoneCrReadsLikeCrLf) {
    EXPECT_EQ(Lines("[***]\rTitle X\r[buildings.House$A]\r"), Lines("[***]\r\nTitle X\r\n[buildings.House$A]\r\n"));
}

TEST_F(CatalogueReaderTest, LongLinesAndEndsAcrossReadBlocks) {
    std::string longLine(200000, 'x');
    EXPECT_EQ(Lines(longLine + "\r\nb"), Strings({longLine, "b"}));
    // The CR of a CR LF as the last byte of a read block.
    std::string edge(65535, 'y');
    EXPECT_EQ(Lines(edge + "\r\nz\r\n"), Strings({edge, "z"}));
    EXPECT_EQ(Lines(edge + "\rz"), Strings({edge, "z"}));
}

TEST_F(CatalogueReaderTest, TrimsBlanksButKeepsTabs) {
    EXPECT_EQ(Lines("  [buildings.House$A]  \r\n   \r\n\t\r\n \tMesh x\t \r\n", true),
              Strings({"[buildings.House$A]", "", "\t", "\tMesh x\t"}));
}

TEST_F(CatalogueReaderTest, MissingCatalogueOrFolderFailsToOpen) {
    CatalogueReader reader;
    EXPECT_FALSE(OpenCatalogue(Folder("nowhere"), reader));
    Write("cat/other.ini", "x");
    EXPECT_FALSE(OpenCatalogue(Folder("cat"), reader));
    std::filesystem::create_directories(Host("dir/static.ini"));
    EXPECT_FALSE(OpenCatalogue(Folder("dir"), reader));
}

TEST_F(CatalogueReaderTest, NamesMatchWithoutRegardToCase) {
    Write("Mods/STD/Static.INI", "a\r\n");
    CatalogueReader reader;
    ASSERT_TRUE(OpenCatalogue(Folder("mods/std"), reader));
    std::string line;
    EXPECT_TRUE(NextCatalogueLine(reader, line));
    EXPECT_EQ(line, "a");
    CloseCatalogue(reader);
}

TEST(CatalogueNames, BuildingHeaders) {
    EXPECT_TRUE(IsBuildingHeader("[buildings.House$A]"));
    EXPECT_TRUE(IsBuildingHeader("[bui"));
    EXPECT_FALSE(IsBuildingHeader("[Buildings.House$A]"));
    EXPECT_FALSE(IsBuildingHeader("[bu"));
    EXPECT_FALSE(IsBuildingHeader("\t[buildings.House$A]"));
}

TEST(CatalogueNames, Cuts) {
    struct Case {
        std::string header, bracket, ends, object;
    };
    const Case cases[] = {
        {"[buildings.House$Kiosk]", "buildings.House$Kiosk", "buildings.House$Kiosk", "Kiosk"},
        {"[buildings.House$Kiosk] //", "buildings.House$Kiosk", "buildings.House$Kiosk] /", "Kiosk] /"},
        {"[buildings.House$Kiosk", "buildings.House$Kiosk", "buildings.House$Kios", "Kios"},
        {"[buildings.House$A$B]", "buildings.House$A$B", "buildings.House$A$B", ""},
        {"[buildings.House$Ab$Cd]", "buildings.House$Ab$Cd", "buildings.House$Ab$Cd", "A"},
        {"[buildings.House]", "buildings.House", "buildings.House", "[buildings.House"},
        {"[bui", "bui", "bu", "[bu"},
        {"[]", "", "", "["},
    };
    for (const Case& c : cases) {
        EXPECT_EQ(SectionNameByBracket(c.header), c.bracket) << c.header;
        EXPECT_EQ(SectionNameByEnds(c.header), c.ends) << c.header;
        EXPECT_EQ(ObjectNameOf(c.header), c.object) << c.header;
    }
}
