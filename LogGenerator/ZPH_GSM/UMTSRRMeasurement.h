#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// A place in the display that no record fills.
class UMTSRRMeasurement final : public Base {
public:
    explicit UMTSRRMeasurement(DecodingRoles& decodingRoles);
};

} // namespace kestrum
