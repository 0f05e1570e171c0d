#pragma once

#include "insight/Events.h"

#include <string>
#include <string_view>

namespace kestrum {

/// The first line of a list of events as CSV.
inline constexpr std::string_view kEventsCsvHead = "time,event,name,was,is,levels\r\n";

/// Appends the line of an event. The time is in UTC, ISO 8601 with microseconds; empty when it is not known.
void appendCsv(std::string& to, const Event& event);

} // namespace kestrum
