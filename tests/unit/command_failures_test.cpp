// Every command's failures, as rows of one table: a catalogue that does not open, a read that
// fails partway, a report (or the rewrite's temporary file) that cannot be created or written.
#include "commands/command_table.h"

#include "map_records.h"
#include "output/app_state.h"
#include "test_support.h"

namespace {

// Something for every command to find, so that each goes as far as its report.
const std::string Catalogue = "[***]\r\nTitle Mods\r\n[buildings.House$A]\r\nMeshLive\r\n"
                              "[buildings.House$A]\r\nColour red\r\nMeshLive 3do/a.sim\r\nMeshDead 3do/a.sim\r\n";
const std::string Map = "mods/mapmods/maps/Fields/actors.static";

struct CommandCase {
    std::string name, output, notOpened;  // output: the report, list or temporary file
};
const CommandCase Cases[] = {
    {"doubled-objects", "Doubled_objects.txt", "static.ini failure: Can't open static.ini"},
    {"irregular-entries", "Irregular_entrys.txt", "static.ini failure: Can't open static.ini"},
    {"empty-references", "Empty_references.txt", "static.ini failure: Can't open static.ini"},
    {"wrong-sim-references", "Missing_3do.txt", "static.ini failure: Can't open static.ini"},
    {"doubled-used-sims", "Doubled_sims_or_meshes.txt", "static.ini failure: Can't open static.ini"},
    {"fmb-list", "Static_list_FMB.txt", "static.ini failure:: Can't read the static,ini"},
    {"fmb-plus-list", "Static_list_FMBplus.txt", "static.ini failure:: Can't read the static,ini"},
    {"missing-objects", "Missing_objects.txt", ""},  // the map check ends without a word
    {"renumber", "static.ini.tmp", "static.ini failure: Can't open file static.ini"},
    {"denumber", "static.ini.tmp", "static.ini failure: Can't open file static.ini"},
};

std::string WriteFailure(const std::string& output) {
    return output == "static.ini.tmp" ? "static.ini failure: Can't write static.ini.tmp"
                                      : "Report failure: Can't write " + output;
}

class CommandFailuresTest : public ScratchTest {
protected:
    CommandResult Run(const CommandCase& c, const HeadlessFileFaults& faults) {
        Restart();
        UseCatalogue(Catalogue, "mods/std/com/maddox/il2/objects");
        Write(Map, MapRecordBytes({BuildingClassName("Missing")}));
        HeadlessSetFileFaults(faults);
        const Command* command = CommandNamed(c.name);
        EXPECT_NE(command, nullptr);
        std::string map = Folder("mods/mapmods/maps/Fields") + "*actors.static";
        return command ? RunCommand(*command, command->takesMap ? map : "") : CommandResult::Done;
    }
    void ExpectNothingWritten(const CommandCase& c) {
        EXPECT_FALSE(Exists("Desktop/" + c.output));
        EXPECT_FALSE(Exists("mods/std/com/maddox/il2/objects/static.ini.tmp"));
        EXPECT_EQ(Read("mods/std/com/maddox/il2/objects/static.ini"), Catalogue);
        EXPECT_TRUE(HeadlessProcesses().empty()) << "no viewer for what was not written";
    }
};

}  // namespace

TEST_F(CommandFailuresTest, EveryCommandRunsCleanWithoutFaults) {
    for (const CommandCase& c : Cases) {
        SCOPED_TRACE(c.name);
        CommandResult result = Run(c, {});
        EXPECT_TRUE(result == CommandResult::Findings || result == CommandResult::Done);
    }
}

TEST_F(CommandFailuresTest, CatalogueThatDoesNotOpen) {
    for (const CommandCase& c : Cases) {
        SCOPED_TRACE(c.name);
        HeadlessFileFaults faults;
        faults.failOpen = "static.ini";
        EXPECT_EQ(Run(c, faults), CommandResult::Failed);
        EXPECT_EQ(Messages(), c.notOpened.empty() ? Strings{} : Strings{c.notOpened});
        ExpectNothingWritten(c);
    }
}

TEST_F(CommandFailuresTest, ReadThatFailsPartwayIsAFailureOfEveryCommand) {
    for (const CommandCase& c : Cases) {
        SCOPED_TRACE(c.name);
        HeadlessFileFaults faults;
        faults.failReadName = "static.ini";
        faults.failReadAfterBytes = 40;
        EXPECT_EQ(Run(c, faults), CommandResult::Failed);
        EXPECT_EQ(Messages(), Strings{"static.ini failure: Can't read static.ini"});
        ExpectNothingWritten(c);
    }
}

TEST_F(CommandFailuresTest, OutputThatCannotBeCreatedOrWritten) {
    for (const CommandCase& c : Cases) {
        for (bool create : {true, false}) {
            SCOPED_TRACE(c.name + (create ? " create" : " write"));
            HeadlessFileFaults faults;
            (create ? faults.failCreate : faults.failWriteName) = c.output;
            faults.failWriteAfterBytes = 0;
            EXPECT_EQ(Run(c, faults), CommandResult::Failed);
            EXPECT_EQ(Messages(), Strings{WriteFailure(c.output)});
            EXPECT_TRUE(HeadlessProcesses().empty());
            EXPECT_EQ(Read("mods/std/com/maddox/il2/objects/static.ini"), Catalogue);
            EXPECT_FALSE(Exists("mods/std/com/maddox/il2/objects/static.ini.tmp"));
            EXPECT_FALSE(Exists("Desktop/" + c.output)) << "nothing cut off is left";
        }
    }
}

TEST_F(CommandFailuresTest, CatalogueThatCannotBeReplacedStaysAsItWas) {
    for (const CommandCase& c : Cases) {
        if (c.output != "static.ini.tmp") continue;
        SCOPED_TRACE(c.name);
        HeadlessFileFaults faults;
        faults.failReplace = true;
        EXPECT_EQ(Run(c, faults), CommandResult::Failed);
        EXPECT_EQ(Messages(), Strings{"static.ini failure: Can't replace static.ini"});
        ExpectNothingWritten(c);
    }
}
