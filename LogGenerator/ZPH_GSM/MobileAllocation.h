#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The frequencies over which a GSM channel hops (3GPP TS 45.002): log code 0x51F8.
class MobileAllocation final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "MobileAllocation"; }
};

} // namespace kestrum
