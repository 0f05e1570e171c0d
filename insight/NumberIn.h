#pragma once

#include "support/Value.h"

#include <optional>
#include <string>
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

/// At most two digits after the point, and no zeros there: "-98", "-98.25".
std::string shortText(double number);
/// "-98.25 dBm"; without a blank where there is no unit.
std::string withUnit(std::string_view text, std::string_view unit);

} // namespace kestrum
