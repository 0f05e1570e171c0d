#pragma once

#include "platform/Console.h"

namespace kestrum {

/// Lines on standard output; lines for developers on standard error when KESTRUM_DEBUG is set.
class LinuxConsole final : public Console {
public:
    LinuxConsole();

    void printLine(std::string_view line) override;
    void debug(std::string_view line) override;
    bool isDebugWatched() const override { return _debugWatched; }

private:
    bool _debugWatched;
};

/// Drops all lines: for a program whose terminal is its display.
class QuietConsole final : public Console {
public:
    void printLine(std::string_view) override {}
    void debug(std::string_view) override {}
    bool isDebugWatched() const override { return false; }
};

} // namespace kestrum
