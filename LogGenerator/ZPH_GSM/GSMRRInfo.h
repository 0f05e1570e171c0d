#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// GSM radio resource state and signal quality: log codes 0x512C, 0x5137, 0x5072 and 0x51F6.
class GSMRRInfo final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "GSMRRInfo"; }
};

} // namespace kestrum
