#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

/// A moment, to the microsecond.
using Date = std::chrono::sys_time<std::chrono::microseconds>;

/// A date's text in display data: UTC, "2026-11-16 06:05:42 +0000".
std::string dateText(Date date);

/// ISO 8601 in UTC, "2026-11-16T06:05:42Z"; `fractionDigits` (0 to 6) digits of the second.
std::string isoText(Date date, int fractionDigits = 0);

/// Reads what `isoText` writes without a fraction; nothing for any other text or a date that does not exist.
std::optional<Date> dateFromIso(std::string_view text);

/// A record's time stamp is CDMA system time (3GPP2 C.S0002): the upper 48 bits count 1.25 ms
/// since 1980-01-06 00:00:00 UTC; the lower 16 bits are fractions and are ignored.
Date dateFromTimeStamp(std::uint64_t timeStamp);
std::uint64_t timeStampFromDate(Date date);

} // namespace kestrum
