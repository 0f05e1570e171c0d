#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// GSM radio resource state and signal quality: log codes 0x512C, 0x5137, 0x5072 and 0x51F6.
class GSMRRInfo final : public Base {
public:
    explicit GSMRRInfo(DecodingRoles& decodingRoles);
};

} // namespace kestrum
