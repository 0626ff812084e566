#include "rewrite/renumbering.h"

#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "output/progress_list.h"
#include "test_support.h"

namespace {

// Joins lines, each followed by the line end that the cycle gives it.
std::string WithEnds(const Strings& lines, const Strings& ends) {
    std::string text;
    for (std::size_t i = 0; i < lines.size(); ++i) text += lines[i] + ends[i % ends.size()];
    return text;
}

int PendingEventsLeft() {
    int left = 0;
    Event event;
    while (TakePendingEvent(event)) ++left;
    return left;
}

// Lines that must come through every rewrite unchanged, and which of them get a number line.
const Strings UserLines = {"// Houses (large) and plates",
                           "[***]",
                           "Title House",
                           "[buildings.House$Kiosk]",
                           "Mesh          3do/Buildings/Kiosk/mono.sim",
                           "",
                           "  [buildings.House$Indented]",
                           "[airfield.Tower$A]",
                           "[Buildings.House$Capital]",
                           "\t[buildings.House$Tab]",
                           "\t(5)",
                           "Title Field (x) ",
                           "(12a)",
                           "()",
                           "(1)(2)",
                           "[buildings.Plate$Road]  ",
                           "   "};

Strings Numbered(const Strings& lines) {
    Strings numbered;
    int number = 0;
    for (const std::string& line : lines) {
        if (line.compare(0, 4, "[bui") == 0) numbered.push_back("(" + std::to_string(number++) + ")");
        numbered.push_back(line);
    }
    return numbered;
}

}  // namespace

TEST(Renumbering, NumberLines) {
    for (const char* line : {"(0)", "(12)", "  (3)  ", "(007)", " (2147483648)"})
        EXPECT_TRUE(IsNumberLine(line)) << line;
    for (const char* line :
         {"", "   ", "()", "(a)", "(1", "1)", "(1)x", "x(1)", "\t(1)", "(1)\t", "(1) (2)", "(-1)", "( 1)",
          "((1))", "12)", "[12)", "(12]", "// House (large)", "Mesh 3do/a(1).sim"})
        EXPECT_FALSE(IsNumberLine(line)) << line;
}

class RenumberCatalogueTest : public ScratchTest {
   protected:
    std::string Catalogue() const { return Read("mods/std/com/maddox/il2/objects/static.ini"); }
    bool TemporaryLeft() const { return Exists("mods/std/com/maddox/il2/objects/static.ini.tmp"); }
    CommandResult Run(const std::string& mode) { return RenumberCatalogue(CatalogueFolder, mode); }
};

TEST_F(RenumberCatalogueTest, RoundTripsUnderEveryLineEnd) {
    const std::vector<Strings> endings = {
        {"\n"}, {"\r"}, {"\r\n"}, {"\n", "\r\n", "\r"}, {std::string(1, '\0')}};
    for (const Strings& ends : endings) {
        SCOPED_TRACE(testing::PrintToString(ends));
        std::string original = WithEnds(UserLines, ends);
        UseCatalogue(original.substr(0, original.size() - ends[(UserLines.size() - 1) % ends.size()].size()));
        Write("mods/std/com/maddox/il2/objects/static.ini.tmp", "stale\r\n(9)\r\n");

        EXPECT_EQ(Run("renumber"), CommandResult::Done);
        EXPECT_EQ(Catalogue(), CrLf(Numbered(UserLines)));
        EXPECT_EQ(Run("renumber"), CommandResult::Done);
        EXPECT_EQ(Catalogue(), CrLf(Numbered(UserLines)));
        EXPECT_EQ(Run("denumber"), CommandResult::Done);
        EXPECT_EQ(Catalogue(), CrLf(UserLines));
        EXPECT_EQ(Run("denumber"), CommandResult::Done);
        EXPECT_EQ(Catalogue(), CrLf(UserLines));
        EXPECT_FALSE(TemporaryLeft());
        HeadlessReset();
    }
}

TEST_F(RenumberCatalogueTest, OldNumbersGiveWayToFreshOnes) {
    UseCatalogue("(7)\r\n[buildings.House$A]\r\n  (3)  \n(0)\r\n[buildings.House$B]\r\n(12)");
    EXPECT_EQ(Run("renumber"), CommandResult::Done);
    EXPECT_EQ(Catalogue(), CrLf({"(0)", "[buildings.House$A]", "(1)", "[buildings.House$B]"}));
    EXPECT_EQ(Messages(), Strings({"Renumber static.ini: Done"}));
}

TEST_F(RenumberCatalogueTest, EmptyCatalogueStaysEmpty) {
    for (const char* mode : {"renumber", "denumber"}) {
        UseCatalogue("");
        EXPECT_EQ(Run(mode), CommandResult::Done);
        EXPECT_EQ(Catalogue(), "");
        EXPECT_FALSE(TemporaryLeft());
    }
    EXPECT_EQ(Messages(), Strings({"Renumber static.ini: Done", "Denumber static.ini: Done"}));
}

TEST_F(RenumberCatalogueTest, ProgressLinesOfBothModes) {
    const std::string catalogue =
        "(4)\r\n[buildings.House$A]\r\nMesh x (y)\r\n  (5)\r\n[buildings.House$B]\r\n";
    UseCatalogue(catalogue);
    ProgressListOn = true;
    OpenProgressList();
    AddProgressLine("left over from an earlier check");
    Run("renumber");
    EXPECT_EQ(ProgressLines(),
              Strings({"Remove => (4)", "[buildings.House$A]", "Mesh x (y)", "Remove =>   (5)",
                       "[buildings.House$B]", "Add => (0)", "[buildings.House$A]", "Mesh x (y)", "Add => (1)",
                       "[buildings.House$B]"}));

    UseCatalogue(catalogue);
    Run("denumber");
    EXPECT_EQ(ProgressLines(), Strings({"Remove => (4)", "[buildings.House$A]", "Mesh x (y)",
                                        "Remove =>   (5)", "[buildings.House$B]"}));
    EXPECT_EQ(Catalogue(), CrLf({"[buildings.House$A]", "Mesh x (y)", "[buildings.House$B]"}));
    EXPECT_EQ(Messages(), Strings({"Renumber static.ini: Done", "Denumber static.ini: Done"}));
}

// One pending event goes through before each kept line and each new number, and only while the
// list is on; the rest stay pending for the event loop.
TEST_F(RenumberCatalogueTest, LetsOneEventThroughPerShownStep) {
    struct Case {
        const char* mode;
        bool listOn;
        int eventsLeft;
    };
    // Three kept lines, two of them headers, one number line.
    const std::string catalogue = "(0)\r\n[buildings.House$A]\r\nMesh x\r\n[buildings.House$B]\r\n";
    for (const Case& c :
         {Case{"denumber", true, 7}, Case{"renumber", true, 5}, Case{"renumber", false, 10}}) {
        SCOPED_TRACE(std::string(c.mode) + (c.listOn ? " list on" : " list off"));
        UseCatalogue(catalogue);
        ProgressListOn = c.listOn;
        if (c.listOn) OpenProgressList();
        for (int i = 0; i < 10; ++i) HeadlessPushPending(OtherStep("anything"));
        Run(c.mode);
        EXPECT_EQ(PendingEventsLeft(), c.eventsLeft);
    }
}

TEST_F(RenumberCatalogueTest, FailuresLeaveTheCatalogueAsItWas) {
    struct Case {
        const char* name;
        HeadlessFileFaults faults;
        std::string message;
    };
    HeadlessFileFaults createFails, firstWriteFails, laterWriteFails, replaceFails, readFails;
    createFails.failCreate = "static.ini.tmp";
    firstWriteFails.failWriteName = laterWriteFails.failWriteName = "STATIC.INI.TMP";
    firstWriteFails.failWriteAfterBytes = 10;
    laterWriteFails.failWriteAfterBytes = 100000;
    replaceFails.failReplace = true;
    readFails.failReadName = "static.ini";
    readFails.failReadAfterBytes = 70000;
    const std::string cannotWrite = "static.ini failure: Can't write static.ini.tmp";
    const std::vector<Case> cases = {
        {"create fails", createFails, cannotWrite},
        {"first write fails", firstWriteFails, cannotWrite},
        {"a later write fails", laterWriteFails, cannotWrite},
        {"replace fails", replaceFails, "static.ini failure: Can't replace static.ini"},
        {"a read fails halfway", readFails, "static.ini failure: Can't read static.ini"}};
    std::string catalogue;
    for (int i = 0; i < 8000; ++i)
        catalogue += "(" + std::to_string(i) + ")\n[buildings.House$N" + std::to_string(i) + "]\n";
    for (const char* mode : {"renumber", "denumber"}) {
        for (const Case& c : cases) {
            SCOPED_TRACE(std::string(mode) + ": " + c.name);
            HeadlessReset();
            UseCatalogue(catalogue);
            HeadlessSetFileFaults(c.faults);
            EXPECT_EQ(Run(mode), CommandResult::Failed);
            EXPECT_EQ(Catalogue(), catalogue);
            EXPECT_FALSE(TemporaryLeft());
            EXPECT_EQ(Messages(), Strings({c.message}));
        }
    }
}

TEST_F(RenumberCatalogueTest, MissingCatalogueWritesNothing) {
    CatalogueFolder = Folder("objects");
    Write("objects/other.ini", "x");
    ProgressListOn = true;
    OpenProgressList();
    AddProgressLine("left over from an earlier check");
    EXPECT_EQ(Run("renumber"), CommandResult::Failed);
    EXPECT_EQ(Messages(), Strings({"static.ini failure: Can't open file static.ini"}));
    EXPECT_EQ(ProgressLines(), Strings{});
    EXPECT_FALSE(Exists("objects/static.ini.tmp"));
    EXPECT_FALSE(Exists("objects/static.ini"));
}
