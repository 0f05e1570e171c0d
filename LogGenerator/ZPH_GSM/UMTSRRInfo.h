#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// UMTS radio resource control (3GPP TS 25.331): state, serving cell, ciphering and transmit power. Log codes 0x4125,
/// 0x4031, 0x4127 and 0x4157, and the telephony service's cell monitor.
class UMTSRRInfo final : public Base {
public:
    explicit UMTSRRInfo(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;

    void showTransmitPower(Record data) const;
    void forgetMonitoredFrequency() const;
};

} // namespace kestrum
