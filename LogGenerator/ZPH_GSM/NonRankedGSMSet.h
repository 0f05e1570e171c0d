#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// A place in the display that no record fills.
class NonRankedGSMSet final : public Base {
public:
    explicit NonRankedGSMSet(DecodingRoles& decodingRoles);
};

} // namespace kestrum
