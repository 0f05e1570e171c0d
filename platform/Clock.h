#pragma once

#include "support/Date.h"

#include <chrono>
#include <string>
#include <string_view>

namespace kestrum {

/// The device's clock and zone.
class Clock {
public:
    virtual ~Clock() = default;

    virtual Date now() const = 0;

    struct Zone {
        std::chrono::seconds offset; ///< east of UTC, daylight saving included
        bool daylightSaving;         ///< in force at that moment
    };
    virtual Zone zoneAt(Date date) const = 0;

    /// `date` as text in the device's zone and locale. `pattern` is a Unicode date pattern (UTS #35) such as
    /// "yyyy-MM-dd HH:mm:ss"; text in single quotes is literal.
    virtual std::string localText(Date date, std::string_view pattern) const = 0;
};

} // namespace kestrum
