#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Measurement and evaluation of the serving cell: log code 0xB17F. Srxlev, Qrxlevmin and the search thresholds are those
/// of cell reselection (3GPP TS 36.304).
class ServingCellMeasurement final : public Base {
public:
    explicit ServingCellMeasurement(DecodingRoles& decodingRoles);
};

} // namespace kestrum
