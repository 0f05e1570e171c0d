#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// UMTS radio resource control (3GPP TS 25.331): state, serving cell, ciphering and transmit power. Log codes 0x4125,
/// 0x4031, 0x4127 and 0x4157, and the telephony service's cell monitor.
class UMTSRRInfo final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "UMTSRRInfo"; }

private:
    void showTransmitPower(Record data) const;
    void forgetMonitoredFrequency() const;
};

} // namespace kestrum
