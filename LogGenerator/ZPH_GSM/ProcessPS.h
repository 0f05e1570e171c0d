#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Packet-switched mobility management (GMM, 3GPP TS 24.008) and registration: log codes 0x7130 and 0x7132.
class ProcessPS final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "ProcessPS"; }
};

} // namespace kestrum
