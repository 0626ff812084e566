// The program from start to end: start-up, the main event loop, shutdown. Gives the exit code, 0.
#pragma once

int RunVerrant();
