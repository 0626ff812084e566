// Message boxes and the event draining by which long commands keep the windows alive.
#pragma once

#include "platform/platform.h"

#include <string>

// A modal box with the title, the text and one OK button; returns when the user confirmed it.
void ShowMessage(const std::string& title, const std::string& text);
// Opens a top-level window. When the system cannot make it the user is told and the program ends,
// as every loop that waits on the window would otherwise wait for ever.
Handle OpenWindowOrEnd(const std::string& title, int left, int top, int clientWidth, int clientHeight,
                       FrameStyle frame);
// Delivers every pending event to its window and drops it, so no command starts inside another.
void DrainPendingEvents();
// The same for at most one pending event.
void DrainOnePendingEvent();
