// The protocol between the end-to-end driver and its probe, a hook DLL in the program's thread:
// another process cannot read a menu under Wine, nor hand a list view pointers, nor measure text in
// the program's fonts. The driver posts the request message to a window of the program; the probe
// answers into the file, in the work folder that run-e2e.sh makes.
#pragma once

#define PROBE_MESSAGE_NAME "VerrantE2EProbeRequest"
#define PROBE_ANSWER_FILE "C:\\verrant-e2e\\probe-answer.txt"

// wParam of the request; lParam is the row of the window's list view where one is needed.
enum ProbeRequest {
    ProbeLayout = 1,      // place, client size, frame; each child: class, text, place, traits, faults; menu
    ProbeRows,            // the name of each row of the window's list view, or each line of its list box
    ProbeSelectRow,       // selects and focuses a row, as a click would
    ProbeEnterRow,        // selects a row and presses Enter on it
    ProbeDoubleClickRow,  // selects a row and double clicks the middle of its name
};
