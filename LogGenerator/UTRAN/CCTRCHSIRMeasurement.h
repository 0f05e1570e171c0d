#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Signal-to-interference ratios of the coded composite transport channels (CCTrCH), one row a channel and timeslot:
/// log code 0xD00C.
class CCTRCHSIRMeasurement final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "CCTRCH SIR Measurement"; }
};

} // namespace kestrum
