#pragma once

#include "frontends/terminal/Screen.h"

namespace kestrum::terminal {

/// Draws an empty card with a thin frame in the middle of the screen, at most as large as the screen. Returns the
/// area inside the frame.
Area drawBox(Screen& screen, int rows, int columns);

} // namespace kestrum::terminal
