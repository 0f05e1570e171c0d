#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The UTRAN neighbour cells, one row a cell: log code 0xD00A.
class UTRANNeighbhorMeasurements final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "NeighbhorMeasurements List"; }
};

} // namespace kestrum
