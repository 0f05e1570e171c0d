#pragma once

#include "LogGenerator/PlaceholderList.h"

namespace kestrum {

/// The GSM neighbour cells: log code 0xD00E. Empty after every record, on purpose.
class GSMNeighbhorMeasurements final : public PlaceholderList {
public:
    explicit GSMNeighbhorMeasurements(DecodingRoles& decodingRoles);
};

} // namespace kestrum
