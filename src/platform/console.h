#pragma once

namespace kestrune::platform {

// Whether standard output is a terminal (so that a progress line may redraw itself).
bool StandardOutputIsTerminal();

// The terminal's width in columns; 80 when it cannot be told.
int TerminalColumns();

}  // namespace kestrune::platform
