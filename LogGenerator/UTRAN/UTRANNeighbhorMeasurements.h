#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The UTRAN neighbour cells, one row a cell: log code 0xD00A.
class UTRANNeighbhorMeasurements final : public Base {
public:
    explicit UTRANNeighbhorMeasurements(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
