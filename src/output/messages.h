// Message boxes and the event draining by which long commands keep the windows alive.
#pragma once

#include <string>

// A modal box with the title, the text and one OK button; returns when the user confirmed it.
void ShowMessage(const std::string& title, const std::string& text);
// Delivers every pending event to its window and drops it, so no command starts inside another.
void DrainPendingEvents();
// The same for at most one pending event.
void DrainOnePendingEvent();
