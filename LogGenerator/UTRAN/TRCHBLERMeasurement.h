#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Block error rates of the transport channels (TrCH), one row a channel: log code 0xD00C.
class TRCHBLERMeasurement final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "TRCH BLER Measurement"; }
    Priority entryPriority() const override { return Priority::Notice; }
};

} // namespace kestrum
