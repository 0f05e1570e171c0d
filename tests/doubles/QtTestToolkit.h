#pragma once

namespace kestrum {

class Toolkit;

/// The one toolkit of a test program with real widgets; it holds the application object. QtTestMain.cpp makes it.
Toolkit& toolkit();

} // namespace kestrum
