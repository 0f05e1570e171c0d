#pragma once

#include "support/Value.h"

#include <optional>
#include <string_view>

namespace kestrum {

/// A number with its unit, which is empty for a plain number.
struct NumberAndUnit {
    double number;
    std::string_view unit; ///< borrowed from the value
};

/// What a value of the display measures: the number of a reading, or of a text such as "-98.00 dBm", which is how a
/// service that decodes itself sends it. Nothing for names, "nan", "Not Present", hexadecimal texts and empty texts.
std::optional<NumberAndUnit> numberIn(const Value& value);

} // namespace kestrum
