#include "checks/irregular_entries.h"

#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "test_support.h"

namespace {

// Irregular lines before the first entry, blank lines, a header of another family that opens an
// entry and one ("[bui" alone) that does not.
const std::string MixedCatalogue =
    "Wobble 0\r\n"
    "   \r\n"
    "// comment\r\n"
    "[buildings.House$A]\r\n"
    "Title A\r\n"
    "MeshLive 3do/a.sim\r\n"
    "Colour red\r\n"
    "[buildings.Tree$B]\r\n"
    "\tMesh 3do/b.sim\r\n"
    "[buiX]\r\n"
    "[***] Trees\r\n"
    "[***]\r\n";

const std::string MixedReport = CrLf({
    "Irregular entrys in your static.ini:",
    "",
    "Irregular entry towards object 0: Wobble 0",
    "Irregular entry towards object 1: Colour red",
    "Irregular entry towards object 2: [buildings.Tree$B]",
    "Irregular entry towards object 2: \tMesh 3do/b.sim",
    "Irregular entry towards object 2: [buiX]",
});

}  // namespace

TEST(IrregularEntries, FirstMatchingPrefixAcceptsTheLine) {
    const std::pair<std::string, std::string> cases[] = {
        {"/--- ruler ---", "/---"},
        {"[_wood]", "[_"},
        {"Titles and more", "Title"},
        {"[buildings.House$Kiosk]", "[buildings.House$"},
        {"MeshDead", "Mesh"},
        {"Body Wood", "Body"},
        {"Panzer 0.01", "Panzer"},
        {"equals House$Kiosk", "equals"},
        {"AddHeightLive 1", "AddHeightLive"},
        {"AddHeightDead 2", "AddHeightDead"},
        {"AlignToLand 1", "AlignToLand"},
        {"[***] Trees", "[***] "},
        {"Ignore", "Ignore"},
        {"PAlign 0", "PAlign"},
        {"[buildings.Plate$Road]", "[buildings.Plate$"},
        {"(12)", "("},
        {"[***x", "[*"},
        {"[airfield]", "[air"},
        {"/", "/"},
        {"[buildings.Furniture$Chair]", "[buildings.Furniture$"},
        {"[buildings.Mountain$Fuji]", "[buildings.Mountain$"},
        {"mesh 3do/x.sim", ""},
        {"[Buildings.House$Kiosk]", ""},
        {"[Airfield]", ""},
        {"", ""},
    };
    for (const auto& [line, prefix] : cases) EXPECT_EQ(RegularLinePrefixOf(line), prefix) << line;
}

class CheckIrregularEntriesTest : public ScratchTest {};

TEST_F(CheckIrregularEntriesTest, ReportAndProgressLines) {
    UseCatalogue(MixedCatalogue);
    EXPECT_EQ(CheckIrregularEntries(), CommandResult::Findings);
    EXPECT_EQ(Desktop("Irregular_entrys.txt"), MixedReport);
    EXPECT_EQ(ProgressWindow, 0u);

    Restart();
    UseCatalogue(MixedCatalogue);
    SwitchListOn();
    EXPECT_EQ(CheckIrregularEntries(), CommandResult::Findings);
    EXPECT_EQ(Desktop("Irregular_entrys.txt"), MixedReport);
    const std::string ruler(41, '*');
    EXPECT_EQ(ProgressLines(), Strings({ruler,
                                        "Irregular entry towards object (0): Wobble 0",
                                        ruler,
                                        "Reg: / => // comment",
                                        "Reg: [buildings.House$ => [buildings.House$A]",
                                        "Reg: Title => Title A",
                                        "Reg: Mesh => MeshLive 3do/a.sim",
                                        ruler,
                                        "Irregular entry towards object (1): Colour red",
                                        ruler,
                                        ruler,
                                        "Irregular entry towards object (2): [buildings.Tree$B]",
                                        ruler,
                                        ruler,
                                        "Irregular entry towards object (2): \tMesh 3do/b.sim",
                                        ruler,
                                        ruler,
                                        "Irregular entry towards object (2): [buiX]",
                                        ruler,
                                        "Reg: [***]  => [***] Trees",
                                        "Reg: [* => [***]",
                                        " ",
                                        "Regular lines: 6",
                                        "Irregular lines: 5"}));
    ASSERT_EQ(HeadlessProcesses().size(), 1u);
    EXPECT_EQ(HeadlessProcesses()[0].commandLine, "\"C:\\WINDOWS\\notepad.exe\" Irregular_entrys.txt");
    EXPECT_EQ(Messages(), Strings{});
}

TEST_F(CheckIrregularEntriesTest, NothingIrregularShowsMessageAndWritesNoReport) {
    for (bool listOn : {false, true}) {
        SCOPED_TRACE(listOn ? "list on" : "list off");
        Restart();
        UseCatalogue("   \r\n[buildings.House$A]\r\n\r\nMesh 3do/a.sim\r\n");
        if (listOn) SwitchListOn();
        EXPECT_EQ(CheckIrregularEntries(), CommandResult::NothingFound);
        EXPECT_EQ(Messages(),
                  Strings({"No irregular objects: No irregular objects found in your static.ini"}));
        EXPECT_FALSE(Exists("Desktop/Irregular_entrys.txt"));
        EXPECT_TRUE(HeadlessProcesses().empty());
        if (listOn) {
            EXPECT_EQ(ProgressLines(),
                      Strings({"Reg: [buildings.House$ => [buildings.House$A]", "Reg: Mesh => Mesh 3do/a.sim",
                               " ", "Regular lines: 2", "Irregular lines: 0"}));
        }
    }
}

TEST_F(CheckIrregularEntriesTest, UnreadableCatalogueTellsAndTouchesNothing) {
    CatalogueFolder = Folder("missing");
    SwitchListOn();
    EXPECT_EQ(CheckIrregularEntries(), CommandResult::Failed);
    EXPECT_EQ(Messages(), Strings({"static.ini failure: Can't open static.ini"}));
    EXPECT_EQ(ProgressLines(), Strings({"left over from an earlier check"}));
    EXPECT_FALSE(Exists("Desktop/Irregular_entrys.txt"));
    EXPECT_TRUE(HeadlessProcesses().empty());
}

TEST_F(CheckIrregularEntriesTest, ReportThatCannotBeWrittenIsNoSuccess) {
    UseCatalogue(MixedCatalogue);
    HeadlessFileFaults faults;
    faults.failWriteName = "Irregular_entrys.txt";
    faults.failWriteAfterBytes = 40;
    HeadlessSetFileFaults(faults);
    EXPECT_EQ(CheckIrregularEntries(), CommandResult::Failed);
    EXPECT_EQ(Messages(), Strings({"Report failure: Can't write Irregular_entrys.txt"}));
    EXPECT_TRUE(HeadlessProcesses().empty());
}

// Events are drained at the progress lines only; with the list off they wait for the loop.
TEST_F(CheckIrregularEntriesTest, DrainsEventsOnlyWhileTheListIsOn) {
    for (bool listOn : {false, true}) {
        SCOPED_TRACE(listOn ? "list on" : "list off");
        Restart();
        UseCatalogue("Colour red\r\n");
        if (listOn) SwitchListOn();
        HeadlessPushPending(OtherStep("anything"));
        CheckIrregularEntries();
        Event event;
        EXPECT_EQ(TakePendingEvent(event), !listOn);
    }
}
