#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Circuit-switched mobility management and registration in brief: log codes 0x7131 and 0x7132.
class ProcessCO final : public Base {
public:
    explicit ProcessCO(DecodingRoles& decodingRoles);
};

} // namespace kestrum
