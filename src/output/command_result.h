#pragma once

// How a command ended; the event loop ignores it, verrant-cli turns it into its exit status.
enum class CommandResult {
    NothingFound,  // ran and found nothing to report
    Findings,      // ran and reported findings
    Failed,        // could not read or write what it needs; the user was told
    NoFolder,      // no catalogue folder was known or chosen
    Done,          // rewrote the catalogue or wrote an object list
};
