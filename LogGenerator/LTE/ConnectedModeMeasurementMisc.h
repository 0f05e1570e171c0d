#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The serving cell in an intra-frequency measurement of connected mode: log code 0xB179. RSRP and RSRQ are filtered by
/// layer 3 (3GPP TS 36.331).
class ConnectedModeMeasurementMisc final : public Base {
public:
    explicit ConnectedModeMeasurementMisc(DecodingRoles& decodingRoles);
};

} // namespace kestrum
