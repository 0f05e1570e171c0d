#pragma once

#include "LogGenerator/PlaceholderList.h"

namespace kestrum {

/// The GSM neighbour cells: log code 0xD00E. Kept: every record empties the list; field displays show it so.
class GSMNeighbhorMeasurements final : public PlaceholderList {
public:
    explicit GSMNeighbhorMeasurements(DecodingRoles& decodingRoles);
};

} // namespace kestrum
