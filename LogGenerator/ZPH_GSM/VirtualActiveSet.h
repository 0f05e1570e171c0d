#pragma once

#include "LogGenerator/PlaceholderList.h"

namespace kestrum {

/// The UMTS virtual active set. Log code 0x417A empties it; nothing fills it.
class VirtualActiveSet final : public PlaceholderList {
public:
    explicit VirtualActiveSet(DecodingRoles& decodingRoles);
};

} // namespace kestrum
