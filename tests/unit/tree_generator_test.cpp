#include "tree_generator.h"

#include "catalogue/catalogue_reader.h"
#include "catalogue/text.h"
#include "checks/doubled_objects.h"
#include "test_support.h"

#include <algorithm>
#include <filesystem>
#include <set>

namespace fs = std::filesystem;

namespace {

TreeShape Shape(int objects, int mods, long long lines = 0) {
    TreeShape shape;
    shape.objects = objects;
    shape.mods = mods;
    shape.mapNames = 300;
    shape.lines = lines;
    return shape;
}

}  // namespace

class TreeGeneratorTest : public ScratchTest {
protected:
    // The catalogue's lines as the program's reader gives them.
    Strings CatalogueLines(const std::string& bytes) {
        UseCatalogue(bytes);
        CatalogueReader reader;
        EXPECT_TRUE(OpenCatalogue(Folder("mods/std/com/maddox/il2/objects"), reader));
        Strings lines;
        std::string line;
        while (NextCatalogueLine(reader, line)) lines.push_back(line);
        CloseCatalogue(reader);
        return lines;
    }
};

TEST(TreeGenerator, SameSeedSameBytes) {
    TreeShape shape = Shape(2000, 20);
    std::string first = GenerateCatalogue(shape);
    EXPECT_EQ(GenerateCatalogue(shape), first);
    shape.seed = 2;
    EXPECT_NE(GenerateCatalogue(shape), first);
}

TEST_F(TreeGeneratorTest, CatalogueHasTheAskedHeadersLinesAndEveryKindOfLine) {
    TreeShape shape = Shape(8000, 30, 120000);
    Strings lines = CatalogueLines(GenerateCatalogue(shape));
    EXPECT_EQ(lines.size(), 120000u);
    Strings names;
    std::set<std::string> titles, bare, families;
    int numberLines = 0, tabbed = 0, kust = 0;
    for (std::size_t i = 0; i < lines.size(); ++i) {
        const std::string& line = lines[i];
        if (IsBuildingHeader(line)) {
            names.push_back(SectionNameByBracket(line));
            families.insert(line.substr(0, line.find('$')));
        }
        if (line == "[***]" && i + 1 < lines.size()) titles.insert(lines[i + 1]);
        if (line == "Mesh" || line == "MeshLive" || line == "MeshDead") bare.insert(line);
        numberLines += !line.empty() && line[0] == '(';
        tabbed += !line.empty() && line[0] == '\t';
        kust += Contains(LowerCopy(line), "$kust") || Contains(LowerCopy(line), "$suribachi");
    }
    EXPECT_EQ(names.size(), 8000u);
    EXPECT_GT(PairDoubledNames(names).size(), 20u);
    EXPECT_TRUE(titles.count("Title House") && titles.count("Title Humans") && titles.count("Title Houses of Kiev winter"));
    EXPECT_GT(titles.size(), 42u + 20u);  // the standard titles and the mods' own
    EXPECT_EQ(bare.size(), 3u);
    EXPECT_EQ(families, std::set<std::string>({"[buildings.House", "[buildings.Furniture", "[buildings.Plate",
                                               "[buildings.Mountain", "[buildings.Tree", "[buildings.Bridge",
                                               "[buildings.Wreck"}));
    EXPECT_GT(numberLines, 2000);
    EXPECT_GT(tabbed, 0);
    EXPECT_GT(kust, 0);
}

TEST_F(TreeGeneratorTest, TreeHoldsPartOfTheMeshesAndAMapOfItsObjects) {
    TreeShape shape = Shape(3000, 30);
    TreeSummary summary;
    std::string error;
    ASSERT_TRUE(WriteGeneratedTree(shape, Host("tree"), summary, error)) << error;
    std::string catalogue = Read("tree/mods/std/com/maddox/il2/objects/static.ini");
    EXPECT_EQ(catalogue, GenerateCatalogue(shape));
    EXPECT_EQ(summary.catalogueLines, 60000);
    Strings lines = CatalogueLines(catalogue);
    Strings names;
    for (const std::string& line : lines)
        if (IsBuildingHeader(line)) names.push_back(SectionNameByBracket(line));
    EXPECT_EQ(static_cast<int>(PairDoubledNames(names).size()), summary.doubledHeaders);

    // Every mesh file is one the catalogue names, and not every named mesh has a file.
    std::set<std::string> named;
    for (const std::string& line : lines) {
        if (!StartsWith(line, "Mesh")) continue;
        std::size_t at = LowerCopy(line).find("3do");
        if (at == std::string::npos) continue;
        std::string path = LowerCopy(line.substr(at + 3));
        std::replace(path.begin(), path.end(), '\\', '/');
        named.insert(path);
    }
    std::set<std::string> found;
    for (const auto& entry : fs::recursive_directory_iterator(Host("tree/mods"))) {
        std::string path = entry.path().generic_string();
        std::size_t at = LowerCopy(path).find("/3do");
        if (!entry.is_regular_file() || at == std::string::npos || path.find("mapmods") != std::string::npos) continue;
        std::string rest = LowerCopy(path.substr(path.find('/', at + 1)));
        EXPECT_TRUE(named.count(rest)) << path;
        found.insert(rest);
    }
    EXPECT_GT(found.size(), named.size() / 2);
    EXPECT_LT(found.size(), named.size());

    std::string map = Read("tree/mods/mapmods/maps/Map1/actors.static");
    EXPECT_EQ(static_cast<long long>(map.size()), summary.mapBytes);
    std::set<std::string> defined(names.begin(), names.end());
    int placed = 0;
    for (std::size_t at = map.find("com.maddox.il2.objects.buildings."); at != std::string::npos;
         at = map.find("com.maddox.il2.objects.buildings.", at + 1)) {
        std::size_t end = map.find('\0', at);
        ASSERT_NE(end, std::string::npos);
        std::string section = map.substr(at + 23, end - at - 23);
        EXPECT_TRUE(defined.count(section) ||
                    StartsWith(section, "buildings.House$Gone_"))
            << section;
        ++placed;
    }
    EXPECT_EQ(placed, 300);
}

TEST_F(TreeGeneratorTest, RefusesAFolderItDidNotWrite) {
    Write("mine/notes.txt", "keep me");
    TreeSummary summary;
    std::string error;
    EXPECT_FALSE(WriteGeneratedTree(Shape(10, 2), Host("mine"), summary, error));
    EXPECT_EQ(Read("mine/notes.txt"), "keep me");
    ASSERT_TRUE(WriteGeneratedTree(Shape(10, 2), Host("tree"), summary, error)) << error;
    EXPECT_TRUE(WriteGeneratedTree(Shape(20, 2), Host("tree"), summary, error)) << error;
}
