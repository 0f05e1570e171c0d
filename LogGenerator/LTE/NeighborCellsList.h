#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The neighbour cells measured in idle mode, one row a cell: log code 0xB180.
class NeighborCellsList final : public Base {
public:
    explicit NeighborCellsList(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;

    void logMeasurements(Record cell) const;
};

} // namespace kestrum
