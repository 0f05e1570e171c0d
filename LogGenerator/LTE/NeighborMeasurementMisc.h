#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The common part of an idle-mode measurement of neighbour cells: log code 0xB180.
class NeighborMeasurementMisc final : public Base {
public:
    explicit NeighborMeasurementMisc(DecodingRoles& decodingRoles);
};

} // namespace kestrum
