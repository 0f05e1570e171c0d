#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Identity and level of the GSM serving cell: log codes 0x5134, 0x5137 and 0x5076, and the telephony service's cell
/// monitor. C1 and C2 are the reselection criteria of 3GPP TS 45.008.
class GSMServingCell final : public Base {
public:
    explicit GSMServingCell(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
