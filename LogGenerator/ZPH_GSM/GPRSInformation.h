#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// What a GSM cell offers for packet data (3GPP TS 44.060): log codes 0x51F4, 0x51F5, 0x51F6, 0x51FB, 0x51FD, 0x5137
/// and 0x7135.
class GPRSInformation final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "GPRSInformation"; }
};

} // namespace kestrum
