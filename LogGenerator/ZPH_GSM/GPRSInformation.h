#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// A GSM cell's parameters for packet data (3GPP TS 44.060): log codes 0x51F4, 0x51F5, 0x51F6, 0x51FB, 0x51FD, 0x5137
/// and 0x7135.
class GPRSInformation final : public Base {
public:
    explicit GPRSInformation(DecodingRoles& decodingRoles);
};

} // namespace kestrum
