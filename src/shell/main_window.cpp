#include "shell/main_window.h"

#include "output/app_state.h"
#include "output/messages.h"
#include "platform/platform.h"

#include <utility>
#include <vector>

namespace {

Handle MenuOf(const std::vector<std::pair<const char*, int>>& items) {
    Handle menu = CreateSubMenu();
    for (const auto& [text, id] : items) AppendMenuItem(menu, text, id);
    return menu;
}

// 0 when the platform cannot make a menu bar.
Handle BuildMainMenuBar() {
    Handle bar = CreateMenuBar();
    if (bar == 0) return 0;
    AppendSubMenu(bar, "File", MenuOf({{"Close", MenuClose}}));

    Handle search = MenuOf({{".. missing objects", MenuMissingObjects},
                            {".. doubled objects", MenuDoubledObjects},
                            {".. irregular entrys", MenuIrregularEntries}});
    AppendMenuSeparator(search);
    AppendSubMenu(search, ".. reference stuff",
                  MenuOf({{".. wrong sim references", MenuWrongSimReferences},
                          {".. doubled used sims", MenuDoubledUsedSims},
                          {".. empty references", MenuEmptyReferences}}));
    AppendSubMenu(bar, "Search", search);

    AppendSubMenu(bar, "Numeration",
                  MenuOf({{"Renumber static.ini", MenuRenumber}, {"Denumber static.ini", MenuDenumber}}));
    AppendSubMenu(bar, "Create",
                  MenuOf({{".. objects list for FMB", MenuListForFmb},
                          {".. objects list for FMB+", MenuListForFmbPlus}}));
    AppendSubMenu(bar, "Path",
                  MenuOf({{"Save path to static.ini/maps folder", MenuSavePath},
                          {"Clear path to static.ini/maps folder", MenuClearPath}}));
    AppendSubMenu(bar, "?", MenuOf({{"Verrant V.1.3 - keeps your static.ini tidy", MenuCredit}}));
    return bar;
}

}  // namespace

void OpenMainWindow() {
    FrameStyle frame;
    frame.systemMenu = true;
    frame.sizingBorder = true;
    MainWindow = OpenWindowOrEnd("Verrant V.1.3", 250, 250, 270, 110, frame);
    OpenCatalogueButton = AddPushButton(MainWindow, "Open static.ini", 5, 15, 80, 22, OpenCatalogueButtonId);
    ProgressToggle = AddToggleButton(MainWindow, "List searching", 5, 50, 80, 22, ProgressToggleId);
    // Without a menu bar the window still works with its two buttons.
    Handle bar = BuildMainMenuBar();
    if (bar != 0) AttachMenuBar(MainWindow, bar);
}
