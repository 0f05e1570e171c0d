#pragma once

#include <string_view>

namespace kestrum {

/// Output that is neither display nor system log.
class Console {
public:
    virtual ~Console() = default;

    /// Writes a line, given without its newline, to standard output.
    virtual void printLine(std::string_view line) = 0;

    /// Writes a line for developers. Ask `isDebugWatched` first when the line is expensive to build.
    virtual void debug(std::string_view line) = 0;
    virtual bool isDebugWatched() const = 0;
};

} // namespace kestrum
