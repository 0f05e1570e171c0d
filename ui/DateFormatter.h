#pragma once

#include "platform/Clock.h"

#include <string>
#include <utility>

namespace kestrum {

/// Dates as text by one Unicode date pattern (UTS #35), in the device's zone and locale.
class DateFormatter {
public:
    DateFormatter(const Clock& clock, std::string pattern) : _clock(clock), _pattern(std::move(pattern)) {}

    std::string stringFromDate(Date date) const { return _clock.localText(date, _pattern); }

private:
    const Clock& _clock;
    std::string _pattern;
};

} // namespace kestrum
