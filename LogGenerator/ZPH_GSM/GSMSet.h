#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The GSM cells ranked for reselection, one row each: log code 0x4005.
class GSMSet final : public Base {
public:
    explicit GSMSet(DecodingRoles& decodingRoles);
};

} // namespace kestrum
