#pragma once

#include "support/Format.h"

#include <string_view>
#include <type_traits>

namespace kestrum {

/// Priorities of syslog(3). The DLF writer logs at the raw number 16, outside the usual eight.
enum class Priority : int { Error = 3, Warning = 4, Notice = 5, Raw16 = 16 };

/// The system's log.
class SystemLog {
public:
    virtual ~SystemLog() = default;

    /// One line, its arguments filled in. Never blocks for long and never fails: a line that cannot be kept is
    /// counted instead. The text is borrowed for the call.
    virtual void write(Priority priority, std::string_view text) = 0;
    /// The same with arguments, formatted without allocating when the line is of usual length.
    template <typename... Arguments>
        requires(sizeof...(Arguments) > 0)
    void write(Priority priority, FormatString<std::type_identity_t<Arguments>...> format,
               const Arguments&... arguments)
    {
        write(priority, formatting::formatted(format, arguments...).text());
    }

    /// How an object's address is shown in a line. Offline, addresses mean nothing and are shown as null, so that
    /// two runs log the same.
    virtual const void* shownAddress(const void* address) const { return address; }
};

} // namespace kestrum
