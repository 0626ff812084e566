// The main event loop: one event at a time, one command per menu item or button, until a close request.
#pragma once

void RunMainEventLoop();
