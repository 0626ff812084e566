#include "checks/doubled_objects.h"
#include "checks/empty_references.h"
#include "checks/irregular_entries.h"
#include "checks/mesh_references.h"
#include "location/catalogue_from_map.h"
#include "location/derived_paths.h"
#include "output/app_state.h"
#include "rewrite/renumbering.h"
#include "test_support.h"

#include <algorithm>
#include <random>

namespace {

const std::string Stars14(14, '*'), Stars38(38, '*');
const MeshOutput List = MeshOutput::ProgressList, Body = MeshOutput::ReportBody;

std::string Joined(std::initializer_list<std::string_view> parts) {
    std::string text;
    for (std::string_view part : parts) text.append(part).append("|");
    text.pop_back();
    return text;
}

MeshIndex IndexOf(const std::string& catalogue) {
    LineReader lines = LinesOf(catalogue);
    return BuildMeshIndex(lines);
}

Strings MeshIndexOf(const std::string& catalogue, bool exclude = false) {
    MeshIndex made = IndexOf(catalogue);
    std::vector<MeshIndexEntry>& index = made.entries;
    if (exclude) ExcludeStandardTitles(index);
    Strings described;
    for (const MeshIndexEntry& e : index)
        described.push_back(
            Joined({std::to_string(e.number), e.title, e.sectionName, e.mesh, e.meshLive, e.meshDead}));
    return described;
}

// The lines one output of a mesh check gives for the index as one window; its reported flag must be
// the one expected.
Strings Emitted(MeshCheck check, const std::vector<MeshIndexEntry>& index, MeshOutput out, bool reported) {
    Strings lines;
    MeshOutputRun run{check, out, [&](const std::string& line) { lines.push_back(line); }};
    OpenMeshOutput(run);
    AddMeshWindow(run, index);
    CloseMeshOutput(run);
    EXPECT_EQ(run.reported, reported);
    return lines;
}

}  // namespace

// The pair lines of a catalogue of these section names, held `window` at a time; every header must
// reach the sink once, in order.
Strings DoubledLines(const Strings& names, NameWindow window, int& passes) {
    std::string catalogue = "[***]\r\n";
    for (const std::string& name : names) catalogue += "  [" + name + "]\r\nMesh 3do/x.sim\r\n[Bui" + name + "]\n";
    Strings lines;
    int expectedIndex = 0;
    passes = 0;
    long long headers = PairDoubledNames(
        [&](LineReader& reader) {
            ++passes;
            reader = LinesOf(catalogue);
            return true;
        },
        window,
        [&](const NamedObject& object) {
            EXPECT_EQ(object.index, expectedIndex++);
            EXPECT_EQ(object.name, names[object.index]);
            if (object.next >= 0) lines.push_back(DoubledObjectLine(object));
        });
    EXPECT_EQ(headers, static_cast<long long>(names.size()));
    return lines;
}

TEST(Checks, DoubledNamesPairEachOccurrenceWithItsNextRepeat) {
    const struct {
        Strings names, lines;
    } cases[] = {
        {{"buiA", "buiB", "buiA", "buiC", "buiB", "buiA"},
         {"Double object (0) => (2): buiA", "Double object (1) => (4): buiB", "Double object (2) => (5): buiA"}},
        {{"buix", "buiy", "buiQ", "buiz", "buiw", "buiQ", "buiv", "buiu", "buit", "buiQ"},
         {"Double object (2) => (5): buiQ", "Double object (5) => (9): buiQ"}},
        {{"buia", "buiA", "buia "}, {}}, {{"bui", "bui"}, {"Double object (0) => (1): bui"}}, {{}, {}}};
    for (const auto& c : cases) {
        int passes = 0;
        EXPECT_EQ(DoubledLines(c.names, NameWindow(), passes), c.lines);
        EXPECT_EQ(passes, 1) << "a catalogue whose names fit in the window is read once";
    }
}

// However small the window, the pairs are those of the plain walk over all pairs.
TEST(Checks, DoubledNamesInSmallWindowsPairAsTheWholeWalkDoes) {
    std::mt19937 random(11);
    for (int round = 0; round < 300; ++round) {
        Strings names(random() % 40);
        for (std::string& name : names) name = "bui" + std::string(1 + random() % 3, static_cast<char>('a' + random() % 4));
        Strings expected;
        for (std::size_t i = 0; i < names.size(); ++i) {
            auto next = std::find(names.begin() + static_cast<long>(i) + 1, names.end(), names[i]);
            if (next != names.end())
                expected.push_back("Double object (" + std::to_string(i) + ") => (" +
                                   std::to_string(next - names.begin()) + "): " + names[i]);
        }
        NameWindow window;
        window.names = 1 + random() % 6;
        window.nameBytes = random() % 2 ? 1 + random() % 20 : window.nameBytes;
        int passes = 0;
        EXPECT_EQ(DoubledLines(names, window, passes), expected) << "round " << round;
        if (names.size() > window.names) {
            EXPECT_GT(passes, 1);
        }
    }
}

TEST(Checks, DoubledNamesFailWhenALaterPassDoesNotOpen) {
    const std::string catalogue = "[buiA]\n[buiB]\n[buiA]\n";
    int passes = 0, objects = 0;
    NameWindow window;
    window.names = 1;
    long long headers = PairDoubledNames(
        [&](LineReader& reader) {
            reader = LinesOf(catalogue);
            return ++passes == 1;
        },
        window, [&](const NamedObject&) { ++objects; });
    EXPECT_EQ(headers, -1);
    EXPECT_EQ(objects, 1);
}

TEST(Checks, FirstMatchingPrefixAcceptsALine) {
    const std::pair<std::string_view, std::string_view> cases[] = {
        {"/--- ruler", "/---"}, {"//---", "/"}, {"/", "/"}, {"[_wood]", "[_"}, {"Titles", "Title"},
        {"[buildings.House$K]", "[buildings.House$"}, {"MeshLive 3do/a.sim", "Mesh"}, {"Body Wood", "Body"},
        {"Panzer 1", "Panzer"}, {"equals A", "equals"}, {"AddHeightLive 1", "AddHeightLive"},
        {"AddHeightDead 2", "AddHeightDead"}, {"AlignToLand 1", "AlignToLand"}, {"[***] Trees", "[***] "},
        {"[***]", "[*"}, {"Ignore", "Ignore"}, {"PAlign 0", "PAlign"}, {"(12)", "("}, {"[airfield]", "[air"},
        {"[buildings.Plate$R]", "[buildings.Plate$"}, {"[buildings.Furniture$C]", "[buildings.Furniture$"},
        {"[buildings.Mountain$F]", "[buildings.Mountain$"}, {"mesh 3do/x.sim", ""}, {"\tMesh 3do/x.sim", ""},
        {"[Buildings.House$K]", ""}, {"[buildings.Tree$T]", ""}, {"[Airfield]", ""}, {"Tree", ""}, {"", ""}};
    for (const auto& [line, prefix] : cases) EXPECT_EQ(RegularLinePrefixOf(line), prefix) << line;
}

// Five characters open an entry here: "[bui" alone does not.
TEST(Checks, IrregularLinesCountBuilLinesAndSkipEmptyOnes) {
    const std::string catalogue =
        "Wobble 0\r\n   \r\n// c\r\n[buildings.House$A]\r\nTitle A\r\nColour red\r\n\r\n"
        "[buildings.Tree$B]\r\n\tMesh x\r\n[buiX]\r\nL";
    auto judged = [&](bool keepRegular) {
        Strings lines;
        LineReader reader = LinesOf(catalogue);
        JudgeCatalogueLines(reader, keepRegular, [&](const JudgedLine& j) {
            lines.push_back(Joined({std::to_string(j.objectNumber), j.prefix, j.line}));
        });
        return lines;
    };
    const Strings irregular = {"0||Wobble 0", "1||Colour red", "2||[buildings.Tree$B]", "2||\tMesh x",
                               "2||[buiX]", "2||L"};
    EXPECT_EQ(judged(false), irregular);
    EXPECT_EQ(judged(true),
              Strings({irregular[0], "0|/|// c", "1|[buildings.House$|[buildings.House$A]", "1|Title|Title A",
                       irregular[1], irregular[2], irregular[3], irregular[4], irregular[5]}));
    EXPECT_EQ(IrregularEntryLine({7, "", "Colour red"}), "Irregular entry towards object 7: Colour red");
}

TEST(Checks, EmptyReferencesAreKeysAloneOnTheirLine) {
    const std::string catalogue =
        "Mesh\r\n[buildings.House$A] // moved\r\nMesh   \r\n  MeshLive\r\nMesh\t\r\nMeshDead 3do/a.sim\r\n"
        "mesh\r\nMesh=\r\nMeshLiveX\r\n[buildings.House$B]\nMeshDead\n[Buildings.House$C]\nMesh";
    Strings found;
    LineReader reader = LinesOf(catalogue);
    FindEmptyReferenceLines(reader, [&](const EmptyReference& r) {
        found.push_back(Joined({std::to_string(r.objectNumber), r.sectionName, r.key}));
    });
    EXPECT_EQ(found, Strings({"-1||Mesh", "0|buildings.House$A] // move|Mesh",
                              "0|buildings.House$A] // move|MeshLive", "1|buildings.House$B|MeshDead",
                              "1|buildings.House$B|Mesh"}));
    EXPECT_EQ(EmptyReferenceLines({-1, "", "MeshDead"}),
              Strings({Stars14, "Object -1", "", "Empty reference: MeshDead"}));
}

TEST(Checks, MeshValueRunsFromTheFirst3doInAnyCase) {
    const struct {
        std::string line;
        bool cut;
        std::string value;
    } cases[] = {{"Mesh 3do/Buildings/Sea/Pier/mono.sim", true, "3do\\Buildings\\Sea\\Pier\\mono.sim"},
                 {"MeshLive ../3DO/x/live.sim", true, "3DO\\x\\live.sim"}, {"Mesh3do", true, "3do"},
                 {"Mesh x3dOx/3do/y.sim", true, "3dOx\\3do\\y.sim"}, {"Mesh 3d o/x.sim", false, "kept"}};
    for (const auto& c : cases) {
        std::string value = "kept";
        EXPECT_EQ(CutMeshValue(c.line, value), c.cut) << c.line;
        EXPECT_EQ(value, c.value) << c.line;
    }
}

TEST(Checks, MeshIndexReadsFromTheFirstGroupMarkerOn) {
    const std::string catalogue =
        CrLf({"[buildings.House$Before]", "Mesh 3do/before.sim", "[***] note", "  [***]  ", " Title Mods ",
              "MeshLive 3do/orphan.sim", "[buildings.House$A]", "Mesh 3do/a/1.sim", "Mesh 3do/a/2.sim",
              "Mesh a/no/folder.sim", "MeshLiveX 3do/a/live.sim", "Mesh", "Mesh\t3do/tab.sim",
              "[Buildings.House$Cap]", "MeshDead ../3DO/a/dead.sim", "[airfield.Thing]",
              "[buildings.Plate$B] // note", "[***]", "Title Later", "MeshLive 3do/b.sim", "[***]", "[bui",
              "[buildings.House$C]"});
    EXPECT_EQ(MeshIndexOf(catalogue),
              Strings({"0| Title Mods |buildings.House$A|3do\\a\\2.sim|3do\\a\\live.sim|3DO\\a\\dead.sim",
                       "1| Title Mods |buildings.Plate$B] // not||3do\\b.sim|",
                       "2|[bui|buildings.House$C|||"}));
    EXPECT_EQ(MeshIndexOf("[buildings.House$A]\r\nMesh 3do/a.sim\r\n[***]x\r\n"), Strings{});
}

TEST(Checks, StandardTitlesAreExcludedWholeAndCaseSensitively) {
    ClearAppState();
    const struct {
        std::string first, later;
        Strings index;
    } cases[] = {{"Title House", "Title Humans", {"0||bui$A|||", "1||bui$B|||"}},
                 {"Title House ", "  Title House  ", {"0|Title House |bui$A|||", "1||bui$B|||"}},
                 {"\tTitle Sea", "Title house", {"0|\tTitle Sea|bui$A|||", "1|Title house|bui$B|||"}},
                 {"Title Houses of Kiev winter", "Title Houses of Kiev Winter",
                  {"0||bui$A|||", "1|Title Houses of Kiev Winter|bui$B|||"}},
                 {"Title Mods", "Title Ho", {"0|Title Mods|bui$A|||", "1|Title Ho|bui$B|||"}}};
    for (const auto& c : cases)
        EXPECT_EQ(MeshIndexOf(CrLf({"[***]", c.first, "[bui$A]", "[***]", c.later, "[bui$B]"}), true),
                  c.index);
}

TEST(Checks, MissingMeshesInTheListAndInTheReport) {
    std::vector<MeshIndexEntry> index(5);
    index[0] = {"", "Std", 0, "3do\\s.sim", "", "", false, false, false};
    index[1] = {"T", "Both", 1, "3do\\m.sim", "3do\\l.sim", "", true, false, false};
    index[2] = {"T", "LiveFound", 2, "", "3do\\l.sim", "3do\\d.sim", false, true, false};
    index[3] = {"T", "DeadOnly", 3, "", "", "3do\\d.sim", false, false, false};
    index[4] = {"T", "NoneFound", 4, "", "3do\\l.sim", "3do\\d.sim", false, false, false};  // both named
    EXPECT_EQ(Emitted(MeshCheck::MissingMeshes, index, List, true),
              Strings({" ", "//**************************", "Starting output", " ", Stars14, "Object (1)",
                       "Both", "Found: Mesh 3do\\m.sim", Stars14, "Object (1)", "Both",
                       "Not found: MeshLive 3do\\l.sim", Stars14, "Object (2)", "LiveFound",
                       "Found: MeshLive 3do\\l.sim", "Not Found: MeshDead 3do\\d.sim", Stars14, "Object (3)",
                       "DeadOnly", "Not Found: MeshDead 3do\\d.sim", Stars14, "Object (4)", "NoneFound",
                       "Not found: MeshLive 3do\\l.sim", "Not Found: MeshDead 3do\\d.sim"}));
    EXPECT_EQ(Emitted(MeshCheck::MissingMeshes, index, Body, true),
              Strings({Stars14, "Object (1)", "Both", "Not found: MeshLive 3do\\l.sim", Stars14, "Object (2)",
                       "LiveFound", "Not found: MeshDead 3do\\d.sim", Stars14, "Object (3)", "DeadOnly",
                       "Not found: MeshDead 3do\\d.sim", Stars14, "Object (4)", "NoneFound",
                       "Not found: MeshLive 3do\\l.sim", "Not found: MeshDead 3do\\d.sim"}));
    index.resize(2);
    index[1].meshLiveFound = true;
    EXPECT_EQ(Emitted(MeshCheck::MissingMeshes, index, Body, false), Strings({"No wrong references found"}));
    EXPECT_EQ(Emitted(MeshCheck::MissingMeshes, index, List, false).back(), "No missing Meshs found");
}

TEST(Checks, SharedLiveDeadMeshesInTheListAndInTheReport) {
    const std::string catalogue =
        CrLf({"[***]", "Title Humans", "[buildings.House$Std]", "MeshLive 3do/s.sim", "MeshDead 3do/s.sim",
              "[***]", "Title Mods", "[buildings.House$Slashes]", "MeshLive 3do/A/l.sim",
              "MeshDead 3do\\A\\l.sim", "[bui$Case]", "MeshLive 3do/a.sim", "MeshDead 3DO/a.sim",
              "[bui$Prefix]", "MeshLive ../3do/a.sim", "MeshDead 3do/a.sim", "[bui$NoValue]",
              "MeshLive a.sim", "MeshDead a.sim"});
    MeshIndex made = IndexOf(catalogue);
    std::vector<MeshIndexEntry>& index = made.entries;
    ClearAppState();
    ExcludeStandardTitles(index);
    const Strings opening = {" ", Stars38, "Using the same MeshLive/MeshDead", Stars38, " "};
    Strings list = opening, report = opening;
    list.insert(list.end(), {Stars14, "Object (1)buildings.House$Slashes", "MeshLive: 3do\\A\\l.sim",
                             "MeshDead: 3do\\A\\l.sim", Stars14, "Object (3)bui$Prefix",
                             "MeshLive: 3do\\a.sim", "MeshDead: 3do\\a.sim"});
    report.insert(report.end(), {Stars14, "Object (1)", "buildings.House$Slashes", "MeshLive: 3do\\A\\l.sim",
                                 "MeshDead: 3do\\A\\l.sim", Stars14, "Object (3)", "bui$Prefix",
                                 "MeshLive: 3do\\a.sim", "MeshDead: 3do\\a.sim"});
    EXPECT_EQ(Emitted(MeshCheck::SharedLiveDeadMeshes, index, List, true), list);
    EXPECT_EQ(Emitted(MeshCheck::SharedLiveDeadMeshes, index, Body, true), report);
    index.resize(1);
    EXPECT_EQ(Emitted(MeshCheck::SharedLiveDeadMeshes, index, Body, false).back(), "No doubled used Meshs found");
}

TEST(Checks, NumberLines) {
    for (const char* line : {"(0)", "(12)", "  (3)  ", "(007)"}) EXPECT_TRUE(IsNumberLine(line)) << line;
    for (const char* line :
         {"", "()", "(a)", "(1", "1)", "(1)x", "x(1)", "\t(1)", "(1) (2)", "(-1)", "( 1)", "((1))"})
        EXPECT_FALSE(IsNumberLine(line)) << line;
}

std::string RewrittenCatalogue(const std::string& catalogue, Numbering numbering) {
    std::string text;
    LineReader reader = LinesOf(catalogue);
    RewriteCatalogue(reader, numbering, [&text](std::string_view piece) { text.append(piece); });
    return text;
}

TEST(Checks, RenumberingRoundTripEndsEveryLineWithCrLf) {
    ClearAppState();
    const std::string plain =
        "// Houses\r[***]\nTitle House\r\n[buildings.House$A]\n\n  [buildings.House$Indented]\r"
        "[airfield.T]\r\n[Buildings.House$Cap]\r\n[bui\n   ";
    const std::string crLf = CrLf({"// Houses", "[***]", "Title House", "[buildings.House$A]", "",
                                   "  [buildings.House$Indented]", "[airfield.T]", "[Buildings.House$Cap]",
                                   "[bui", "   "});
    const std::string numbered =
        CrLf({"// Houses", "[***]", "Title House", "(0)", "[buildings.House$A]", "",
              "  [buildings.House$Indented]", "[airfield.T]", "[Buildings.House$Cap]", "(1)", "[bui", "   "});
    EXPECT_EQ(RewrittenCatalogue(plain, Numbering::Renumber), numbered);
    EXPECT_EQ(RewrittenCatalogue(numbered, Numbering::Renumber), numbered);
    EXPECT_EQ(RewrittenCatalogue(numbered, Numbering::Denumber), crLf);
    EXPECT_EQ(RewrittenCatalogue(plain, Numbering::Denumber), crLf);
    EXPECT_EQ(RewrittenCatalogue("(7)\n[bui\r\n  (3)  \r(0)\r\n[bui\r\n(12)", Numbering::Renumber),
              CrLf({"(0)", "[bui", "(1)", "[bui"}));
    EXPECT_EQ(RewrittenCatalogue("", Numbering::Renumber), "");
}

TEST(Checks, PathsDerivedFromTheFirstMods) {
    const struct {
        std::string path, modsRoot, mapsPattern;
    } cases[] = {{"D:\\mod\\", "ods\\", "ods\\mapmods\\maps\\*.*"},
                 {"D:\\Sim\\MODS\\STD\\com\\", "D:\\Sim\\Mods\\", "D:\\Sim\\Mods\\mapmods\\maps\\*.*"},
                 {"D:\\mods_old\\Sim\\MODS\\STD\\", "D:\\mods\\", "D:\\mods\\mapmods\\maps\\*.*"}};
    for (const auto& c : cases) {
        EXPECT_EQ(DeriveModsRoot(c.path), c.modsRoot) << c.path;
        EXPECT_EQ(DeriveMapsPattern(c.path), c.mapsPattern) << c.path;
    }
    const std::string tail = "mods\\std\\com\\maddox\\il2\\objects\\";
    EXPECT_EQ(DeriveCatalogueFolderFromMap("D:\\Sim\\MODS\\MapMods\\maps\\*a.static"), "D:\\Sim\\" + tail);
    EXPECT_EQ(DeriveCatalogueFolderFromMap("D:\\Modding\\Sim\\MODS\\MapMods\\maps\\A\\*a"), "D:\\" + tail);
    EXPECT_EQ(DeriveCatalogueFolderFromMap("D:\\Sim\\Maps\\Fields\\*actors.static"), tail);
    EXPECT_EQ(DeriveCatalogueFolderFromMap("mods\\maps\\*actors.static"), tail);
}
