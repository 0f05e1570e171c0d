#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Packet-switched mobility management (GMM, 3GPP TS 24.008) and registration: log codes 0x7130 and 0x7132.
class ProcessPS final : public Base {
public:
    explicit ProcessPS(DecodingRoles& decodingRoles);
};

} // namespace kestrum
