// The protocol between the end-to-end driver and its probe, a hook DLL that runs inside the
// program's thread: another process cannot read a menu under Wine, nor hand a list view pointers.
// The driver posts the request message to a window of the program; the probe answers into the file
// named by the environment value below, which the program inherits from the driver.
#pragma once

#define PROBE_MESSAGE_NAME "VerrantE2EProbeRequest"
#define PROBE_FILE_VARIABLE "VERRANT_E2E_PROBE_FILE"

// wParam of the request; lParam is a row where one is needed.
enum ProbeRequest {
    ProbeMenu = 1,       // the window's menu bar, one line per item: depth, kind, id, state, text
    ProbeRows = 2,       // the first list view of the window: its columns, then one line per row
    ProbeSelectRow = 3,  // selects and focuses a row of that list view, as a click would
    ProbeRowPoint = 4,   // the client point at the middle of a row's name
    ProbeCaptions = 5,   // each child's text, the width it needs in its font, its width, and the font
};
