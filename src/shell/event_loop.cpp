#include "shell/event_loop.h"

#include "commands/command_table.h"
#include "output/app_state.h"
#include "output/progress_list.h"
#include "platform/platform.h"
#include "shell/main_window.h"

namespace {

// The toggle's own state counts, taken at the click the loop sees: a click dropped while a command
// ran changed the toggle's look but nothing else.
void FollowProgressToggle() {
    ProgressListOn = IsToggleDown(ProgressToggle);
    bool open = IsWindowOpen(ProgressWindow);
    if (ProgressListOn && !open) OpenProgressList();
    if (!ProgressListOn && open) CloseProgressList();
}

void RunMainWindowEvent(Event& event) {
    ActivateTopWindow(MainWindow);
    if (event.kind == EventKind::MenuItem && event.id == MenuClose) {
        event.kind = EventKind::CloseRequest;
    } else if (event.kind == EventKind::Control && event.id == ProgressToggleId) {
        FollowProgressToggle();
    } else if (event.kind == EventKind::MenuItem || event.kind == EventKind::Control) {
        if (const Command* command = CommandWithId(event.id)) RunCommand(*command);
    }
}

}  // namespace

void RunMainEventLoop() {
    for (;;) {
        Event event = WaitForEvent();
        if (event.window == MainWindow) RunMainWindowEvent(event);
        if (event.kind == EventKind::CloseRequest) return;
    }
}
