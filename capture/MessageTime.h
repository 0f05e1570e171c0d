#pragma once

#include "support/Bytes.h"
#include "support/Date.h"
#include "support/Value.h"

#include <optional>
#include <string_view>

namespace kestrum {

struct ChannelMessage;
class PropertyLists;

/// The moment that a text gives in UTC: "2026-11-16T06:05:42.125Z" (ISO 8601; the fraction may be absent) or the form
/// of display data, "2026-11-16 06:05:42 +0000". Nothing for another text, and for years before 1970 or after 2099.
std::optional<Date> momentFromText(std::string_view text);

/// A record's time stamp; nothing for a stamp of 0.
std::optional<Date> timeOf(const ChannelMessage& record);
/// The time of an IFX tree as it was received: the text "Time" at its root.
std::optional<Date> timeOf(const Value& tree);
/// The time of a channel message: of a record or of an IFX tree. Nothing for a message that is neither.
std::optional<Date> timeOf(Bytes message, PropertyLists& lists);

} // namespace kestrum
