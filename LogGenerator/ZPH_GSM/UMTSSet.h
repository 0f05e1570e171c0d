#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The UMTS cells ranked for reselection (log code 0x4005), or the UMTS neighbours of the telephony service's cell
/// monitor: whichever came last. One row each.
class UMTSSet final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "UMTSSet"; }
};

} // namespace kestrum
