#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The cells of the UMTS active set (3GPP TS 25.331), one row each: log code 0x417A.
class ActiveSet final : public Base {
public:
    explicit ActiveSet(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
