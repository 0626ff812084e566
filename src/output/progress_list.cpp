#include "output/progress_list.h"

#include "output/app_state.h"
#include "output/messages.h"
#include "platform/platform.h"

void OpenProgressList() {
    ProgressWindow = OpenWindowOrEnd("List searching window", 650, 320, 370, 470, FrameStyle{});
    ProgressList = AddListControl(ProgressWindow, 10, 20, 350, 430, 1);
}

void CloseProgressList() {
    CloseTopWindow(ProgressWindow);
    ProgressWindow = ProgressList = 0;
}

void ClearProgressList() { ClearListControl(ProgressList); }

void AddProgressLine(const std::string& text) { AppendListLine(ProgressList, text); }
