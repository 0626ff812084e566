#include "output/messages.h"

#include "platform/platform.h"

void ShowMessage(const std::string& title, const std::string& text) { ShowMessageBox(title, text); }

void DrainPendingEvents() {
    Event event;
    while (TakePendingEvent(event)) {
    }
}

void DrainOnePendingEvent() {
    Event event;
    TakePendingEvent(event);
}
