#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Signal-to-interference ratios of the coded composite transport channels (CCTrCH), one row a channel and timeslot:
/// log code 0xD00C.
class CCTRCHSIRMeasurement final : public Base {
public:
    explicit CCTRCHSIRMeasurement(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
