#pragma once

#include <cstddef>

namespace kestrum::bench {

/// How often the heap was asked for memory since the program began.
std::size_t allocations();

} // namespace kestrum::bench
