// The protocol between the end-to-end driver and its probe, a hook DLL in the program's thread: another
// process cannot read a menu under Wine, nor hand a list view pointers, nor measure text in the program's
// fonts. The driver posts a request to a window of the program; the probe answers into the file.
#pragma once

#define PROBE_MESSAGE_NAME "VerrantE2EProbeRequest"
#define E2E_WORK_FOLDER "C:\\verrant-e2e\\"  // made by run-e2e.sh
#define PROBE_ANSWER_FILE E2E_WORK_FOLDER "probe-answer.txt"

enum ProbeRequest {       // in wParam; lParam is the row of the window's list view where one is needed
    ProbeLayout = 1,      // place, client size, frame; each child: class, text, place, traits, faults; menu
    ProbeRows,            // the name of each row of the window's list view, or each line of its list box
    ProbeSelectRow,       // selects and focuses a row, as a click would
    ProbeEnterRow,        // selects a row and presses Enter on it
    ProbeDoubleClickRow,  // selects a row and double clicks the middle of its name
};
