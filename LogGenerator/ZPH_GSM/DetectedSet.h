#pragma once

#include "LogGenerator/PlaceholderList.h"

namespace kestrum {

/// The UMTS detected set. Log code 0x417A empties it; nothing fills it.
class DetectedSet final : public PlaceholderList {
public:
    explicit DetectedSet(DecodingRoles& decodingRoles);
};

} // namespace kestrum
