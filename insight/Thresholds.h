#pragma once

#include <cstdint>
#include <string_view>

namespace kestrum {

/// How good a value is. Ordered: a greater grade is a better one.
enum class Grade : std::uint8_t { NoService, Poor, Fair, Good, Excellent };

/// "excellent", "good", "fair", "poor", "no service".
std::string_view word(Grade grade);

} // namespace kestrum
