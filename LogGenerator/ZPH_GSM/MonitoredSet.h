#pragma once

#include "LogGenerator/PlaceholderList.h"

namespace kestrum {

/// The UMTS monitored set. Log code 0x417A empties it; nothing fills it.
class MonitoredSet final : public PlaceholderList {
public:
    explicit MonitoredSet(DecodingRoles& decodingRoles);
};

} // namespace kestrum
