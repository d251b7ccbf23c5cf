#pragma once

#include <string>

namespace Studio
{

/// Sends what Qt says to the log, category "Qt". When Qt gives up (no display, no plug-in for it) the program ends with
/// status 2 and one line on standard error instead of an abort. Before the application object is made.
void InstallQtMessages();

/// The application object stands: what Qt gives up on from now on is not the display.
void NoteApplicationStarted();

/// Why no window can be shown on this machine, one line; empty when nothing speaks against it.
std::string FindDisplayProblem();

} // namespace Studio
