#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// A place in the display that no record fills.
class CellChangeCounters final : public Base {
public:
    explicit CellChangeCounters(DecodingRoles& decodingRoles);
};

} // namespace kestrum
