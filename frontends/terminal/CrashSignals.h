#pragma once

#include <termios.h>

namespace kestrum::terminal {

/// While the screen is up, the signals of a crash first give the terminal back, and then end the program as they would
/// have done. Made once the terminal library has opened the screen; one at a time.
class CrashSignals {
public:
    explicit CrashSignals(const termios& before); ///< the terminal's modes before it was opened
    ~CrashSignals();
    CrashSignals(const CrashSignals&) = delete;
    CrashSignals& operator=(const CrashSignals&) = delete;
};

} // namespace kestrum::terminal
