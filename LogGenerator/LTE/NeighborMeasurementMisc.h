#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// What the neighbour cells of an idle-mode measurement have in common: log code 0xB180.
class NeighborMeasurementMisc final : public Base {
public:
    explicit NeighborMeasurementMisc(DecodingRoles& decodingRoles);
};

} // namespace kestrum
