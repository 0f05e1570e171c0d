#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Block error rates of the transport channels (TrCH), one row a channel: log code 0xD00C.
class TRCHBLERMeasurement final : public Base {
public:
    explicit TRCHBLERMeasurement(DecodingRoles& decodingRoles);
};

} // namespace kestrum
