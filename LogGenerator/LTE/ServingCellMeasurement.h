#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Measurement and evaluation of the serving cell: log code 0xB17F. Srxlev, Qrxlevmin and the search thresholds are those
/// of cell reselection (3GPP TS 36.304).
class ServingCellMeasurement final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;
};

} // namespace kestrum
