#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// A place in the display that no record fills.
class UMTSRRMeasurement final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "UMTSRRMeasurement"; }
};

} // namespace kestrum
