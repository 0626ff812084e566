// Runs the built verrant-cli on a tree in the scratch folder.
#include "map_records.h"
#include "test_support.h"

#include <cstdlib>
#include <sys/wait.h>

namespace {

struct CliRun {
    int status = -1;
    std::string out, err;
};

std::string Quoted(const std::string& word) { return "'" + word + "'"; }

}  // namespace

class CliMissingObjectsTest : public ScratchTest {
protected:
    void SetUp() override {
        ScratchTest::SetUp();
        ASSERT_EQ(root.find("mod"), std::string::npos) << "the tree must be the first \"mod\" in its paths";
        Write("Sim/Mods/std/com/maddox/il2/objects/static.ini", "[buildings.House$Kiosk]\r\n");
        Write("Sim/Mods/MapMods/maps/Fields/actors.static",
              MapRecordBytes(
                  {BuildingClassName("Barn"), BuildingClassName("Kiosk"), BuildingClassName("Barn")}));
        Write("Sim/Mods/MapMods/maps/Calm/actors.static", MapRecordBytes({BuildingClassName("Kiosk")}));
        Write("reports/.keep", "");
    }
    CliRun Run(const std::string& arguments) {
        std::string command = Quoted(VERRANT_CLI_PATH) + " missing-objects --report-dir " +
                              Quoted(Host("reports")) + " " + arguments + " >" + Quoted(Host("out")) + " 2>" +
                              Quoted(Host("err"));
        CliRun run;
        int raw = std::system(command.c_str());
        run.status = WIFEXITED(raw) ? WEXITSTATUS(raw) : -1;
        run.out = Read("out");
        run.err = Read("err");
        return run;
    }
    std::string Map(const std::string& name) {
        return "--map " + Quoted(Host("Sim/Mods/MapMods/maps/" + name));
    }
};

TEST_F(CliMissingObjectsTest, CatalogueFoundFromTheMapPath) {
    CliRun run = Run(Map("Fields/actors.static"));
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(Read("reports/Missing_objects.txt"), CrLf({"Missing objects in your static.ini:", "",
                                                         "buildings.House$Barn", "buildings.House$Barn"}));
}

TEST_F(CliMissingObjectsTest, AllFoundExitsZeroWithoutReport) {
    CliRun run = Run(Map("Calm/actors.static") + " --progress");
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.out, "Found object (0): buildings.House$Kiosk\n\nTotal number of objects: 1\n");
    EXPECT_EQ(run.err, "No missing objects found: All maps objects found in your static.ini\n");
    EXPECT_FALSE(Exists("reports/Missing_objects.txt"));
}

TEST_F(CliMissingObjectsTest, GivenCatalogueIsUsed) {
    Write("other/static.ini", "[buildings.House$Barn]\r\n");
    CliRun run = Run(Map("Fields/actors.static") + " --catalogue " + Quoted(Host("other")));
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(Read("reports/Missing_objects.txt"),
              CrLf({"Missing objects in your static.ini:", "", "buildings.House$Kiosk"}));
}

TEST_F(CliMissingObjectsTest, RefusalsExitTwoWithOneLine) {
    Write("Maps/Fields/actors.static", MapRecordBytes({BuildingClassName("Kiosk")}));
    Write("empty/readme.txt", "");
    Write("Sim/Mods/MapMods/maps/Fields/load.ini", "[MAP]\r\n");
    Write("Sim/Mods/MapMods/maps/Fields/static.ini", MapRecordBytes({BuildingClassName("Kiosk")}));
    struct Case {
        std::string arguments, err;
    };
    const Case cases[] = {
        {"--map " + Quoted(Host("Maps/Fields/actors.static")),
         "static.ini not found: " + Host("Maps/Fields/mods/std/com/maddox/il2/objects/") + "\n"},
        {Map("Fields/actors.static") + " --catalogue " + Quoted(Host("empty")),
         "static.ini failure: Can't open static.ini\n"},
        {Map("Fields/load.ini"), "Wrong file selected: This is not a file of type 'actor.static'\n"},
        {Map("Fields/static.ini"), "Wrong file selected: This is not a file of type 'actor.static'\n"},
        {Map("Fields/absent"), "Wrong file selected: This is not a file of type 'actor.static'\n"},
        {Map("Fields"), "Wrong file selected: This is not a file of type 'actor.static'\n"},
        {"", "verrant-cli: missing-objects needs --map FILE\n"},
    };
    for (const Case& c : cases) {
        CliRun run = Run(c.arguments);
        EXPECT_EQ(run.status, 2) << c.arguments;
        EXPECT_EQ(run.err, c.err) << c.arguments;
        EXPECT_FALSE(Exists("reports/Missing_objects.txt")) << c.arguments;
    }
}

TEST_F(CliMissingObjectsTest, OnlyTheExactNameStaticIniIsRefused) {
    Write("Sim/Mods/MapMods/maps/Fields/Static.ini", MapRecordBytes({BuildingClassName("Barn")}));
    CliRun run = Run(Map("Fields/Static.ini"));
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(Read("reports/Missing_objects.txt"),
              CrLf({"Missing objects in your static.ini:", "", "buildings.House$Barn"}));
}
