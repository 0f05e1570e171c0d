#pragma once

#include "capture/Position.h"
#include "platform/ChannelMessage.h"
#include "support/Value.h"

#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

namespace kestrum {

class PropertyLists;

/// The node of an IFX tree that has the position.
inline constexpr std::string_view kPositionNode = "Position";

/// A position as a node of a tree: the texts "Fix", "Latitude", "Longitude", "Speed" and "Time". All of them are empty
/// without a position.
DictionaryRef positionNode(const std::optional<Position>& position);
/// The position in such a node; nothing for a node without one, and for any other value.
std::optional<Position> positionIn(const Value& node);

/// The code of the telephony service's record of a position. Codes from 0xFF8000 on are additions of voxd: displays do
/// not ask for them.
inline constexpr LogCode kPositionRecord = ChannelMessage::kExtraCodes + 0x8000;

/// A position as a record with a time stamp of the log beside it. The payload is the node above.
std::vector<std::byte> positionRecord(const std::optional<Position>& position, std::uint64_t timeStamp,
                                      const PropertyLists& lists);

} // namespace kestrum
