#include "maps/missing_objects_window.h"

#include "map_records.h"
#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "test_support.h"

namespace {

const std::string Title = "Searching missing objects";
const int CloseId = 2, OkId = 3;

}  // namespace

class MissingObjectsWindowTest : public ScratchTest {
protected:
    void SetUp() override {
        ScratchTest::SetUp();
        ASSERT_EQ(root.find("mod"), std::string::npos) << "the tree must be the first \"mod\" in its paths";
        Write("Sim/MODS/STD/com/maddox/il2/objects/static.ini", "[buildings.House$Kiosk]\r\n");
        Write("Sim/MODS/MapMods/maps/Fields/actors.static",
              MapRecordBytes({BuildingClassName("Kiosk"), BuildingClassName("Barn")}));
        Write("Sim/MODS/MapMods/maps/Fields/load.ini", "[MAP]\r\n");
    }
    std::string Fields() const { return Folder("Sim/MODS/MapMods/maps/Fields"); }
    // A step that notes the window and its status line as they are at that point of the script.
    HeadlessStep Look() {
        return [this] {
            window = HeadlessFindWindow(Title);
            status = ControlText(HeadlessControlByKind(window, "textbox"));
            return OtherStep(Title)();
        };
    }
    Handle window = 0;
    std::string status;
};

TEST_F(MissingObjectsWindowTest, OkWithoutAFilePickedSaysNoFileSelected) {
    const std::vector<std::vector<HeadlessStep>> scripts = {
        {},
        {BrowserStep(Title, Folder("Sim/MODS/MapMods/maps"), "Fields", false)},
        {BrowserStep(Title, "", "C:", false)},
        {BrowserStep(Title, Fields(), "actors.static", true), BrowserStep(Title, Fields(), "", false)},
    };
    for (const std::vector<HeadlessStep>& script : scripts) {
        HeadlessReset();
        for (const HeadlessStep& step : script) HeadlessScript(step);
        HeadlessScript(ControlStep(Title, OkId));
        HeadlessScript(Look());
        ShowMissingObjectsWindow("");
        EXPECT_EQ(status, "No file selected") << script.size();
        EXPECT_EQ(Messages(), Strings{});
        EXPECT_TRUE(HeadlessProcesses().empty());
    }
}

TEST_F(MissingObjectsWindowTest, PickingTheMapAndOkWritesTheReportAndKeepsTheFolder) {
    HeadlessScript(BrowserStep(Title, Fields(), "actors.static", true));
    HeadlessScript(ControlStep(Title, OkId));
    HeadlessScript(ControlStep(Title, OkId));
    HeadlessScript(Look());
    HeadlessScript(ControlStep(Title, CloseId));
    ShowMissingObjectsWindow("");
    EXPECT_EQ(Desktop("Missing_objects.txt"),
              CrLf({"Missing objects in your static.ini:", "", "buildings.House$Barn"}));
    EXPECT_EQ(HeadlessProcesses().size(), 2u);
    EXPECT_EQ(CatalogueFolder, Folder("Sim") + "mods\\std\\com\\maddox\\il2\\objects\\");
    EXPECT_EQ(status, ShownMapPath(Fields() + "actors.static"));
    EXPECT_EQ(Messages(), Strings{});
    EXPECT_EQ(HeadlessFindWindow(Title), 0u);
    EXPECT_EQ(HeadlessWaitsRunDry(), 0);
}

TEST_F(MissingObjectsWindowTest, FilesThatAreNoMapsAreRefused) {
    Write("Sim/MODS/MapMods/maps/Fields/static.ini", MapRecordBytes({BuildingClassName("Kiosk")}));
    for (const std::string name : {"load.ini", "static.ini"}) {
        HeadlessReset();
        HeadlessScript(BrowserStep(Title, Fields(), name, true));
        HeadlessScript(ControlStep(Title, OkId));
        HeadlessScript(Look());
        ShowMissingObjectsWindow("");
        EXPECT_EQ(Messages(), Strings({"Wrong file selected: This is not a file of type 'actor.static'"}))
            << name;
        EXPECT_EQ(status, ShownMapPath(Fields() + name)) << name;
        EXPECT_TRUE(HeadlessProcesses().empty()) << name;
    }
}


TEST(MissingObjectsWindow, ShownPathKeepsAtMost43Characters) {
    const std::string path43 = "C:\\" + std::string(40, 'a');
    EXPECT_EQ(ShownMapPath(path43), path43);
    EXPECT_EQ(ShownMapPath(path43 + "bc"), "..." + std::string(38, 'a') + "bc");
}
