// Runs the built verrant-cli on a tree in the scratch folder.
#include "map_records.h"
#include "test_support.h"

#include <cstdlib>
#include <filesystem>
#include <sys/wait.h>

namespace {

std::string Quoted(const std::string& word) { return "'" + word + "'"; }

}  // namespace

class CliMissingObjectsTest : public ScratchTest {
protected:
    void SetUp() override {
        ScratchTest::SetUp();
        ASSERT_EQ(root.find("mod"), std::string::npos) << "the tree must be the first \"mod\" in its paths";
        Write("Sim/Mods/std/com/maddox/il2/objects/static.ini", "[buildings.House$Kiosk]\r\n");
        const std::string map = MapRecordBytes({BuildingClassName("Barn"), BuildingClassName("Kiosk")});
        Write("Sim/Mods/MapMods/maps/Fields/actors.static", map);
        Write("Sim/Mods/MapMods/maps/Fields/Static.ini", map);
        Write("Sim/Mods/MapMods/maps/Fields/static.ini", map);
        Write("Sim/Mods/MapMods/maps/Fields/load.ini", "[MAP]\r\n");
        Write("Sim/Mods/MapMods/maps/Calm/actors.static", MapRecordBytes({BuildingClassName("Kiosk")}));
        Write("Maps/Fields/actors.static", map);
        Write("other/static.ini", "[buildings.House$Barn]\r\n");
        Write("empty/readme.txt", "");
    }
    std::string Map(const std::string& name) {
        return "--map " + Quoted(Host("Sim/Mods/MapMods/maps/" + name));
    }
};

TEST_F(CliMissingObjectsTest, ExitStatusMessagesAndReport) {
    const std::string wrongFile = "Wrong file selected: This is not a file of type 'actor.static'\n";
    struct Case {
        std::string arguments;
        int status;
        std::string err, missing;  // missing: the one name of the report, "" when none is written
    };
    const Case cases[] = {
        {Map("Fields/actors.static"), 1, "", "buildings.House$Barn"},
        {Map("Fields/Static.ini"), 1, "", "buildings.House$Barn"},
        {Map("Fields/actors.static") + " --catalogue " + Quoted(Host("other")), 1, "",
         "buildings.House$Kiosk"},
        {Map("Calm/actors.static"), 0,
         "No missing objects found: All maps objects found in your static.ini\n", ""},
        {"--map " + Quoted(Host("Maps/Fields/actors.static")), 2,
         "static.ini not found: " + Host("Maps/Fields/mods/std/com/maddox/il2/objects/") + "\n", ""},
        {Map("Fields/actors.static") + " --catalogue " + Quoted(Host("empty")), 2,
         "static.ini failure: Can't open static.ini\n", ""},
        {Map("Fields/load.ini"), 2, wrongFile, ""},
        {Map("Fields/static.ini"), 2, wrongFile, ""},
        {Map("Fields/absent"), 2, wrongFile, ""},
        {Map("Fields"), 2, wrongFile, ""},
        {"", 2, "verrant-cli: missing-objects needs --map FILE\n", ""},
    };
    for (const Case& c : cases) {
        std::filesystem::remove_all(Host("reports"));
        Write("reports/.keep", "");
        std::string command = Quoted(VERRANT_CLI_PATH) + " missing-objects --report-dir " +
                              Quoted(Host("reports")) + " " + c.arguments + " >" + Quoted(Host("out")) +
                              " 2>" + Quoted(Host("err"));
        int raw = std::system(command.c_str());
        EXPECT_EQ(WIFEXITED(raw) ? WEXITSTATUS(raw) : -1, c.status) << c.arguments;
        EXPECT_EQ(Read("err"), c.err) << c.arguments;
        if (c.missing.empty())
            EXPECT_FALSE(Exists("reports/Missing_objects.txt")) << c.arguments;
        else
            EXPECT_EQ(Read("reports/Missing_objects.txt"),
                      CrLf({"Missing objects in your static.ini:", "", c.missing}))
                << c.arguments;
    }
}
