#pragma once

#include <string_view>

namespace kestrum {

/// What kind of value a key has. It decides how a value is drawn over time: numbers as a curve, identities as marks,
/// states as a strip.
enum class Kind { Level, Ratio, Time, Percentage, Counter, Number, Identity, State, Text };

/// "level", "ratio", ...
std::string_view word(Kind kind);

} // namespace kestrum
