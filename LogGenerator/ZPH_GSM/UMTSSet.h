#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The UMTS cells of the last record, one row each: those ranked for reselection (log code 0x4005), or the neighbours
/// of the telephony service's cell monitor.
class UMTSSet final : public Base {
public:
    explicit UMTSSet(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
