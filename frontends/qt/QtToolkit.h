#pragma once

#include "platform/Toolkit.h"

#include <memory>

namespace kestrum {

/// The UI toolkit on Qt Widgets. At most one; adapters that live on Qt's event loop are made after it and destroyed
/// before it. Where no display can be reached it says on standard error what to do instead and ends the program with
/// status 1.
std::unique_ptr<Toolkit> makeQtToolkit();

} // namespace kestrum
