#pragma once

#include "support/Format.h"

#include <string_view>
#include <type_traits>

namespace kestrum {

/// Priorities of syslog(3). The DLF writer logs at 16, which is outside syslog's range of 0 to 7.
enum class Priority : int { Error = 3, Warning = 4, Notice = 5, Raw16 = 16 };

/// The system's log.
class SystemLog {
public:
    virtual ~SystemLog() = default;

    /// Logs one line. Never blocks for long and never fails: lines that do not fit the queue are counted. The text is
    /// borrowed for the call.
    virtual void write(Priority priority, std::string_view text) = 0;
    /// Whether lines of this priority are kept. Ask it before work that only a line needs.
    virtual bool passes(Priority) const { return true; }
    /// Formats a line that passes and logs it. A line of up to 128 bytes is formatted without allocating.
    template <typename... Arguments>
        requires(sizeof...(Arguments) > 0)
    void write(Priority priority, FormatString<std::type_identity_t<Arguments>...> format,
               const Arguments&... arguments)
    {
        if (passes(priority))
            write(priority, formatting::formatted(format, arguments...).text());
    }

    /// The address to print for an object. An offline decoder prints null, so that two runs give equal logs.
    virtual const void* shownAddress(const void* address) const { return address; }
};

} // namespace kestrum
