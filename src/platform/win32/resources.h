// Resource ids shared by the program's resource script and the Win32 side.
#pragma once

#define VERRANT_ICON_ID 1
