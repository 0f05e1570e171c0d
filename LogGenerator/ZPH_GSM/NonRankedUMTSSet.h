#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// A place in the display that no record fills.
class NonRankedUMTSSet final : public Base {
public:
    explicit NonRankedUMTSSet(DecodingRoles& decodingRoles);
};

} // namespace kestrum
