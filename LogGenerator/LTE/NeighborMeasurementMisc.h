#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// What the neighbour cells of an idle-mode measurement have in common: log code 0xB180.
class NeighborMeasurementMisc final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;
};

} // namespace kestrum
