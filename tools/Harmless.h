#pragma once

#include <string>
#include <string_view>

namespace kestrum {

/// A text that does nothing to a terminal: control characters, those that turn the direction of writing, and bytes that
/// are no UTF-8 become \xnn. On one line.
std::string onOneLine(std::string_view raw);

/// The same, less the ends of lines, which stay.
std::string onLines(std::string_view raw);

} // namespace kestrum
