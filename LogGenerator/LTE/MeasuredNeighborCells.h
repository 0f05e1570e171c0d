#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The neighbour cells measured with the serving cell in connected mode, one row a cell: log code 0xB179.
class MeasuredNeighborCells final : public Base {
public:
    explicit MeasuredNeighborCells(DecodingRoles& decodingRoles);
};

} // namespace kestrum
