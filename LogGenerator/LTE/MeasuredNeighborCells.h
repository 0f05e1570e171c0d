#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The neighbour cells measured with the serving cell in connected mode, one row a cell: log code 0xB179.
class MeasuredNeighborCells final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;
};

} // namespace kestrum
