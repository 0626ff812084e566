#include "rewrite/mission_builder_list.h"

#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "test_support.h"

namespace {

const std::string Ruler = "//=========================================";

Strings Heading(const std::string& title) { return {Ruler, "[***]", title, Ruler}; }

Strings Join(std::initializer_list<Strings> parts) {
    Strings lines;
    for (const Strings& part : parts) lines.insert(lines.end(), part.begin(), part.end());
    return lines;
}

// Every kind of line the lists tell apart, with LF ends to show they are read like any others.
const std::string Catalogue =
    "[buildings.House$Early]\n"
    "  [buildings.House$Indented]  \n"
    "[***]\n"
    "  Title House \n"
    "(0)\n"
    "[buildings.House$Kiosk]\n"
    "Mesh 3do/Buildings/Kiosk/mono.sim\n"
    "[buildings.Plate$Road]\n"
    "[buildings.House$Barn]\n"
    "[buildings.House$KUST_Big]\n"
    "[buildings.Furniture$Suribachi_Rock]\n"
    "Title $kust marks nothing but is ignored\n"
    "[***]\n"
    "  Title House \n"
    "[buildings.House$TEMPLATES]\n"
    "[***]\n"
    "Title Field\n"
    "[buildings.House$Second$Name]\n"
    "[buildings.House]\n"
    "[Buildings.House$Capital]\n"
    "[***] more\n"
    "[***]\n"
    "[buildings.House$TitleHeader]\n"
    "[buildings.Mountain$Peak]\n"
    "[***]\n"
    "  Title House \n"
    "[buildings.House$Back]\n"
    "[***]";

}  // namespace

class MissionBuilderListTest : public ScratchTest {};

TEST_F(MissionBuilderListTest, BothModes) {
    struct Case {
        const char* mode;
        const char* file;
        Strings lines;
    };
    const std::vector<Case> cases = {
        {"fmb", "Static_list_FMB.txt",
         Join({{"Object list for fmb", "", "(0) Early", "(1) Indented"},
               Heading("  Title House "),
               {"(2) Kiosk", "(3) Barn"},
               Heading("Title Field"),
               {"(4) Secon", "(5) [buildings.House"},
               Heading("[buildings.House$TitleHeader]"),
               {"(6) Peak"},
               Heading("  Title House "),
               {"(7) Back"}})},
        {"fmb+", "Static_list_FMBplus.txt",
         Join({{"Object list for fmb+", "", "(0) Early", "(1) Indented"},
               Heading("  Title House "),
               {"(2) Kiosk", "(3) Road", "(4) Barn", "(5) TEMPLATES"},
               Heading("Title Field"),
               {"(6) Secon", "(7) [buildings.House"},
               Heading("[buildings.House$TitleHeader]"),
               {"(8) Peak"},
               Heading("  Title House "),
               {"(9) Back"}})},
    };
    for (const Case& c : cases) {
        SCOPED_TRACE(c.mode);
        HeadlessReset();
        HeadlessSetDesktopFolder(Folder("Desktop"));
        HeadlessSetEnvironment("WINDIR", "C:\\WINDOWS");
        UseCatalogue(Catalogue);
        EXPECT_EQ(CreateMissionBuilderList(CatalogueFolder, c.mode), CommandResult::Done);
        EXPECT_EQ(Desktop(c.file), CrLf(c.lines));
        ASSERT_EQ(HeadlessProcesses().size(), 1u);
        EXPECT_EQ(HeadlessProcesses()[0].commandLine, std::string("\"C:\\WINDOWS\\notepad.exe\" ") + c.file);
        EXPECT_EQ(HeadlessProcesses()[0].workingFolder, Folder("Desktop"));
        EXPECT_EQ(Messages(), Strings{});
    }
}

TEST_F(MissionBuilderListTest, PlateNumberPassesToTheNextHeader) {
    UseCatalogue(
        "[buildings.Plate$A]\r\n[buildings.House$Templates]\r\n[buildings.House$Platform]\r\n"
        "[buildings.House$B]\r\n[buildings.Plate$C]\r\n");
    CreateMissionBuilderList(CatalogueFolder, "fmb");
    EXPECT_EQ(Desktop("Static_list_FMB.txt"), CrLf({"Object list for fmb", "", "(0) Platform", "(1) B"}));
    CreateMissionBuilderList(CatalogueFolder, "fmb+");
    EXPECT_EQ(Desktop("Static_list_FMBplus.txt"),
              CrLf({"Object list for fmb+", "", "(0) A", "(1) Templates", "(2) Platform", "(3) B", "(4) C"}));
}

TEST_F(MissionBuilderListTest, CatalogueWithoutHeadersGivesTheFirstLinesAndOpens) {
    UseCatalogue("[***]\r\nTitle House\r\nMesh 3do/x.sim\r\n");
    EXPECT_EQ(CreateMissionBuilderList(CatalogueFolder, "fmb"), CommandResult::Done);
    EXPECT_EQ(Desktop("Static_list_FMB.txt"), CrLf({"Object list for fmb", ""}));
    EXPECT_EQ(HeadlessProcesses().size(), 1u);
}

TEST_F(MissionBuilderListTest, UnreadableCatalogueWritesNoList) {
    for (const char* mode : {"fmb", "fmb+"})
        EXPECT_EQ(CreateMissionBuilderList(Folder("nowhere"), mode), CommandResult::Failed);
    EXPECT_EQ(Messages(), Strings({"static.ini failure:: Can't read the static,ini",
                                   "static.ini failure:: Can't read the static,ini"}));
    EXPECT_FALSE(Exists("Desktop/Static_list_FMB.txt"));
    EXPECT_FALSE(Exists("Desktop/Static_list_FMBplus.txt"));
    EXPECT_TRUE(HeadlessProcesses().empty());
}
