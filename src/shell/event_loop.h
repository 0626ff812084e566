// The main event loop: one event at a time, one command per menu item or button, until a close request.
#pragma once

void RunMainEventLoop();
// The "needs the folder" step: asks with the folder chooser while no catalogue folder is known.
// True when one is known afterwards; otherwise the command ends without a message.
bool EnsureCatalogueFolderKnown();
