#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The neighbour cells measured in idle mode, one row a cell: log code 0xB180.
class NeighborCellsList final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

private:
    void logMeasurements(Record cell) const;
};

} // namespace kestrum
