#pragma once

#include <termios.h>

namespace kestrum::terminal {

/// While the screen is open, a crash signal first restores the terminal and then ends the program as it would without
/// this object. Create it after the terminal library has opened the screen. One at a time.
class CrashSignals {
public:
    explicit CrashSignals(const termios& before); ///< the terminal's modes before the screen was opened
    ~CrashSignals();
    CrashSignals(const CrashSignals&) = delete;
    CrashSignals& operator=(const CrashSignals&) = delete;
};

} // namespace kestrum::terminal
