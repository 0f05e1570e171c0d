#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Identity, frequencies and bandwidths of the serving cell (3GPP TS 36.331): log codes 0xB0C2 and 0xB0C1, and the
/// telephony service's cell monitor.
class LTEServingCellInfo final : public Base {
public:
    explicit LTEServingCellInfo(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
