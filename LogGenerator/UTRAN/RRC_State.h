#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Mode of the radio resource control (3GPP TS 25.331): log code 0xD0E0.
class RRC_State final : public Base {
public:
    explicit RRC_State(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
