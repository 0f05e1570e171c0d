#pragma once

#include "platform/Toolkit.h"

#include <memory>

namespace kestrum {

/// The UI toolkit on Qt Widgets. At most one may exist. Create adapters that use Qt's event loop after it, and
/// destroy them before it. When no display can be reached, it writes an advice to standard error and ends the program
/// with status 1.
std::unique_ptr<Toolkit> makeQtToolkit();

} // namespace kestrum
