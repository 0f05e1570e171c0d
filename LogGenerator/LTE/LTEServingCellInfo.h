#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Identity, frequencies and bandwidths of the serving cell (3GPP TS 36.331): log codes 0xB0C2 and 0xB0C1, and the
/// telephony service's cell monitor.
class LTEServingCellInfo final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "LTE Serving Cell Info"; }
};

} // namespace kestrum
