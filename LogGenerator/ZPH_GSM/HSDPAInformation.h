#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// HARQ processes of HSDPA (3GPP TS 25.321): log code 0x4221.
class HSDPAInformation final : public Base {
public:
    explicit HSDPAInformation(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
