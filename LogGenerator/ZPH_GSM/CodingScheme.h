#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// A place in the display that no record fills.
class CodingScheme final : public Base {
public:
    explicit CodingScheme(DecodingRoles& decodingRoles);
};

} // namespace kestrum
