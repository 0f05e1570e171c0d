#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The frequencies over which a GSM channel hops (3GPP TS 45.002): log code 0x51F8.
class MobileAllocation final : public Base {
public:
    explicit MobileAllocation(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
