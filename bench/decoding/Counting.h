#pragma once

#include <cstddef>

namespace kestrum::bench {

/// The number of heap allocations since the program's start.
std::size_t allocations();

} // namespace kestrum::bench
