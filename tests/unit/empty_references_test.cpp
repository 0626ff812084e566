#include "checks/empty_references.h"

#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "test_support.h"

namespace {

// A bare key before the first header, a header with text after its "]", keys with blanks, with a
// tab, with a value, in lower case and run on, and a "[Buildings" line that is no header.
const std::string MixedCatalogue =
    "Mesh\r\n"
    "[buildings.House$A] // moved\r\n"
    "Mesh   \r\n"
    "  MeshLive\r\n"
    "Mesh\t\r\n"
    "MeshDead 3do/a.sim\r\n"
    "mesh\r\n"
    "Mesh=\r\n"
    "MeshLiveX\r\n"
    "[buildings.House$B]\n"
    "MeshDead\n"
    "[Buildings.House$C]\n"
    "Mesh";

const std::string Ruler14(14, '*');

const std::string MixedReport = CrLf({"Empty references in your static.ini",
                                      "",
                                      Ruler14,
                                      "Object -1",
                                      "",
                                      "Empty reference: Mesh",
                                      Ruler14,
                                      "Object 0",
                                      "buildings.House$A] // move",
                                      "Empty reference: Mesh",
                                      "Object 0",
                                      "buildings.House$A] // move",
                                      "Empty reference: MeshLive",
                                      "Object 1",
                                      "buildings.House$B",
                                      "Empty reference: MeshDead",
                                      Ruler14,
                                      "Object 1",
                                      "buildings.House$B",
                                      "Empty reference: Mesh"});

const std::string NothingFoundReport =
    "Empty references in your static.ini\r\n\r\n"
    "No empty references found in your static.ini";

class FindEmptyReferencesTest : public ScratchTest {};

}  // namespace

TEST_F(FindEmptyReferencesTest, ReportAndProgressLines) {
    UseCatalogue(MixedCatalogue);
    EXPECT_EQ(FindEmptyReferences(CatalogueFolder), CommandResult::Findings);
    EXPECT_EQ(Desktop("Empty_references.txt"), MixedReport);
    EXPECT_EQ(ProgressWindow, 0u);

    Restart();
    UseCatalogue(MixedCatalogue);
    SwitchListOn();
    EXPECT_EQ(FindEmptyReferences(CatalogueFolder), CommandResult::Findings);
    EXPECT_EQ(Desktop("Empty_references.txt"), MixedReport);
    EXPECT_EQ(ProgressLines(), Strings({"Empty references in your Static.ini",
                                        " ",
                                        Ruler14,
                                        "Object -1",
                                        "",
                                        "Empty reference: Mesh",
                                        Ruler14,
                                        "Object 0",
                                        "buildings.House$A] // move",
                                        "Empty reference: Mesh",
                                        Ruler14,
                                        "Object 0",
                                        "buildings.House$A] // move",
                                        "Empty reference: MeshLive",
                                        Ruler14,
                                        "Object 1",
                                        "buildings.House$B",
                                        "Empty reference: MeshDead",
                                        Ruler14,
                                        "Object 1",
                                        "buildings.House$B",
                                        "Empty reference: Mesh"}));
    ASSERT_EQ(HeadlessProcesses().size(), 1u);
    EXPECT_EQ(HeadlessProcesses()[0].commandLine, "\"C:\\WINDOWS\\notepad.exe\" Empty_references.txt");
    EXPECT_EQ(HeadlessProcesses()[0].workingFolder, Folder("Desktop"));
    EXPECT_EQ(Messages(), Strings{});
}

TEST_F(FindEmptyReferencesTest, NothingFoundIsStillReportedAndOpened) {
    for (bool listOn : {false, true}) {
        SCOPED_TRACE(listOn ? "list on" : "list off");
        Restart();
        UseCatalogue("[buildings.House$A]\r\nMesh 3do/a.sim\r\nMeshLive\t\r\n");
        Write("Desktop/Empty_references.txt", "an older report, longer than the new one will be ........");
        if (listOn) SwitchListOn();
        EXPECT_EQ(FindEmptyReferences(CatalogueFolder), CommandResult::NothingFound);
        EXPECT_EQ(Desktop("Empty_references.txt"), NothingFoundReport);
        EXPECT_EQ(HeadlessProcesses().size(), 1u);
        EXPECT_EQ(Messages(), Strings{});
        if (listOn) {
            EXPECT_EQ(ProgressLines(), Strings({"Empty references in your Static.ini", " ",
                                                "No empty references found in your static.ini"}));
        }
    }
}

TEST_F(FindEmptyReferencesTest, UnreadableCatalogueTellsAndTouchesNothing) {
    SwitchListOn();
    EXPECT_EQ(FindEmptyReferences(Folder("missing")), CommandResult::Failed);
    EXPECT_EQ(Messages(), Strings({"static.ini failure: Can't open static.ini"}));
    EXPECT_EQ(ProgressLines(), Strings({"left over from an earlier check"}));
    EXPECT_FALSE(Exists("Desktop/Empty_references.txt"));
    EXPECT_TRUE(HeadlessProcesses().empty());
}

TEST_F(FindEmptyReferencesTest, ReportThatCannotBeWrittenIsNoSuccess) {
    HeadlessFileFaults createFails, writeFails;
    createFails.failCreate = "Empty_references.txt";
    writeFails.failWriteName = "Empty_references.txt";
    writeFails.failWriteAfterBytes = 20;
    for (const HeadlessFileFaults& faults : {createFails, writeFails}) {
        Restart();
        UseCatalogue(MixedCatalogue);
        HeadlessSetFileFaults(faults);
        EXPECT_EQ(FindEmptyReferences(CatalogueFolder), CommandResult::Failed);
        EXPECT_EQ(Messages(), Strings({"Report failure: Can't write Empty_references.txt"}));
        EXPECT_TRUE(HeadlessProcesses().empty());
    }
}

TEST_F(FindEmptyReferencesTest, DrainsEventsAtFindingsWhileTheListIsOn) {
    const struct {
        bool listOn;
        std::string catalogue;
        bool drained;
    } cases[] = {
        {false, "Mesh\r\n", false},
        {true, "Mesh 3do/a.sim\r\n", false},
        {true, "Mesh\r\n", true},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.catalogue + (c.listOn ? " list on" : " list off"));
        Restart();
        UseCatalogue(c.catalogue);
        if (c.listOn) SwitchListOn();
        HeadlessPushPending(OtherStep("anything"));
        FindEmptyReferences(CatalogueFolder);
        Event event;
        EXPECT_EQ(TakePendingEvent(event), !c.drained);
    }
}
