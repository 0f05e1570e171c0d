#pragma once

#include "frontends/terminal/Screen.h"

namespace kestrum::terminal {

/// An empty card in the middle of the screen, at most as large as the screen, with a thin frame around it. Returns what is
/// inside of it.
Area drawBox(Screen& screen, int rows, int columns);

} // namespace kestrum::terminal
