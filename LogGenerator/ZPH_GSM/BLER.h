#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Block errors of the UMTS transport channels: log code 0x4116.
class BLER final : public Base {
public:
    explicit BLER(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
