#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The GSM neighbour cells: log code 0xD00E. Empty after every record, on purpose.
class GSMNeighbhorMeasurements final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;
};

} // namespace kestrum
