#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The networks that count as the serving one (3GPP TS 24.008), one row each: log code 0x7150.
class EquivalentPLMNList final : public Base {
public:
    explicit EquivalentPLMNList(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
