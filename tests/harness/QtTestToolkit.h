#pragma once

namespace kestrum {

class Toolkit;

/// The toolkit of a test program with real widgets. It owns the application object. QtTestMain.cpp creates it.
Toolkit& toolkit();

} // namespace kestrum
