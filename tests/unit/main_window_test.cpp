#include "shell/main_window.h"

#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "test_support.h"

namespace {

// Every menu entry as "Title/Item=id", "Title/-" for a separator and "Title/Sub/Item=id" inside a
// sub-menu, in menu order.
void FlattenMenu(Handle menu, const std::string& path, Strings& entries) {
    for (const HeadlessMenuItem& item : HeadlessMenuItems(menu)) {
        if (item.separator)
            entries.push_back(path + "-");
        else if (item.subMenu)
            FlattenMenu(item.subMenu, path + item.text + "/", entries);
        else
            entries.push_back(path + item.text + "=" + std::to_string(item.id));
    }
}

std::string Geometry(const HeadlessControl& control) {
    return control.kind + " \"" + control.text + "\" " + std::to_string(control.left) + "," +
           std::to_string(control.top) + " " + std::to_string(control.width) + "x" +
           std::to_string(control.height);
}

}  // namespace

class MainWindowTest : public ScratchTest {};

TEST_F(MainWindowTest, WindowAndButtons) {
    OpenMainWindow();
    const HeadlessWindow* window = HeadlessWindowOf(MainWindow);
    ASSERT_NE(window, nullptr);
    EXPECT_EQ(window->title, "Verrant V.1.3");
    EXPECT_TRUE(window->open);
    EXPECT_EQ(std::vector<int>({window->left, window->top, window->clientWidth, window->clientHeight}),
              std::vector<int>({250, 250, 270, 110}));
    EXPECT_TRUE(window->frame.systemMenu);
    EXPECT_TRUE(window->frame.sizingBorder);

    Strings controls;
    for (Handle control : window->controls) controls.push_back(Geometry(*HeadlessControlOf(control)));
    EXPECT_EQ(controls,
              Strings({"push \"Open static.ini\" 5,15 80x22", "toggle \"List searching\" 5,50 80x22"}));
    EXPECT_EQ(HeadlessControlOf(OpenCatalogueButton)->id, OpenCatalogueButtonId);
    EXPECT_EQ(HeadlessControlOf(ProgressToggle)->id, ProgressToggleId);
    EXPECT_NE(OpenCatalogueButtonId, ProgressToggleId);
    EXPECT_FALSE(IsToggleDown(ProgressToggle));
}

TEST_F(MainWindowTest, MenuTable) {
    OpenMainWindow();
    Handle bar = HeadlessWindowOf(MainWindow)->menuBar;
    ASSERT_NE(bar, 0u);
    Strings titles;
    for (const HeadlessMenuItem& item : HeadlessMenuItems(bar)) {
        titles.push_back(item.text);
        EXPECT_NE(item.subMenu, 0u) << item.text;
    }
    EXPECT_EQ(titles, Strings({"File", "Search", "Numeration", "Create", "Path", "?"}));

    Strings entries;
    FlattenMenu(bar, "", entries);
    ASSERT_FALSE(entries.empty());
    // The credit line's text is free; it is the last entry and carries id 13.
    const std::string credit = entries.back();
    ASSERT_EQ(credit.rfind("?/", 0), 0u);
    ASSERT_GT(credit.size(), std::string("?/=13").size());
    EXPECT_EQ(credit.substr(credit.size() - 3), "=13");
    entries.pop_back();
    EXPECT_EQ(entries, Strings({
                           "File/Close=1",
                           "Search/.. missing objects=2",
                           "Search/.. doubled objects=3",
                           "Search/.. irregular entrys=4",
                           "Search/-",
                           "Search/.. reference stuff/.. wrong sim references=5",
                           "Search/.. reference stuff/.. doubled used sims=14",
                           "Search/.. reference stuff/.. empty references=15",
                           "Numeration/Renumber static.ini=6",
                           "Numeration/Denumber static.ini=7",
                           "Create/.. objects list for FMB=8",
                           "Create/.. objects list for FMB+=9",
                           "Path/Save path to static.ini/maps folder=11",
                           "Path/Clear path to static.ini/maps folder=12",
                       }));
}

TEST_F(MainWindowTest, NoMenuBarStillGivesTheButtons) {
    HeadlessSetMenuBarFails(true);
    OpenMainWindow();
    const HeadlessWindow* window = HeadlessWindowOf(MainWindow);
    ASSERT_NE(window, nullptr);
    EXPECT_TRUE(window->open);
    EXPECT_EQ(window->menuBar, 0u);
    EXPECT_EQ(window->controls.size(), 2u);
    EXPECT_NE(ProgressToggle, 0u);
}
