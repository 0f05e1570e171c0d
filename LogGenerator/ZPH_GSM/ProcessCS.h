#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Circuit-switched mobility management (MM, 3GPP TS 24.008) and registration: log codes 0x7131 and 0x7132.
class ProcessCS final : public Base {
public:
    explicit ProcessCS(DecodingRoles& decodingRoles);
};

} // namespace kestrum
