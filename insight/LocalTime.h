#pragma once

#include "support/Date.h"

#include <string>
#include <string_view>

namespace kestrum {

class Clock;

/// The device's day: "2026-11-16".
std::string dayText(const Clock& clock, Date at);
/// "13:05:44"; "2026-11-15 13:05:44" when that is not on the day `today`.
std::string momentText(const Clock& clock, Date at, std::string_view today);

} // namespace kestrum
