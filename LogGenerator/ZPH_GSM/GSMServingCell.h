#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Identity and level of the GSM serving cell: log codes 0x5134, 0x5137 and 0x5076, and the telephony service's cell
/// monitor. C1 and C2 are the reselection criteria of 3GPP TS 45.008.
class GSMServingCell final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "GSMServingCell"; }
};

} // namespace kestrum
