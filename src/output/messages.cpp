#include "output/messages.h"

#include "platform/platform.h"

#include <cstdlib>

void ShowMessage(const std::string& title, const std::string& text) { ShowMessageBox(title, text); }

Handle OpenWindowOrEnd(const std::string& title, int left, int top, int clientWidth, int clientHeight,
                       FrameStyle frame) {
    Handle window = OpenTopWindow(title, left, top, clientWidth, clientHeight, frame);
    if (window != 0) return window;
    ShowMessage("Window failure", "Can't open the window " + title);
    std::exit(2);
}

void DrainPendingEvents() {
    Event event;
    while (TakePendingEvent(event)) {
    }
}

void DrainOnePendingEvent() {
    Event event;
    TakePendingEvent(event);
}
