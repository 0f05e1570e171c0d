#pragma once

#include <string_view>

namespace kestrum {

/// Where the program writes what is neither display nor log.
class Console {
public:
    virtual ~Console() = default;

    /// A line on standard output (without its newline).
    virtual void printLine(std::string_view line) = 0;

    /// A line for whoever watches the program under development. Whoever builds a costly one asks first.
    virtual void debug(std::string_view line) = 0;
    virtual bool isDebugWatched() const = 0;
};

} // namespace kestrum
