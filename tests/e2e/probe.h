// The protocol between the end-to-end driver and its probe, a hook DLL in the program's thread:
// another process cannot read a menu under Wine, nor hand a list view pointers, nor measure text in
// the program's fonts. The driver posts the request message to a window of the program; the probe
// answers into the file named by the environment value, which the program inherits from the driver.
#pragma once

#define PROBE_MESSAGE_NAME "VerrantE2EProbeRequest"
#define PROBE_FILE_VARIABLE "VERRANT_E2E_PROBE_FILE"

// wParam of the request; lParam is the row of the window's list view where one is needed.
enum ProbeRequest {
    ProbeMenu = 1,        // each item indented by its depth: "ID TEXT", a sub-menu's TEXT, or "-"
    ProbeLayout,          // place, client size and frame; each child: class, text, place, traits, faults
    ProbeRows,            // the name of each row of the window's list view
    ProbeSelectRow,       // selects and focuses a row, as a click would
    ProbeEnterRow,        // selects a row and presses Enter on it
    ProbeDoubleClickRow,  // selects a row and double clicks the middle of its name
};
