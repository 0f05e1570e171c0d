#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The UMTS cells ranked for reselection (log code 0x4005), or the UMTS neighbours of the telephony service's cell
/// monitor: whichever came last. One row each.
class UMTSSet final : public Base {
public:
    explicit UMTSSet(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
