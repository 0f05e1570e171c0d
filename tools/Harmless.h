#pragma once

#include <string>
#include <string_view>

namespace kestrum::tools {

/// A text that is safe to show on a terminal, on one line. Control characters, characters that change the writing
/// direction, and invalid UTF-8 become \xnn.
std::string onOneLine(std::string_view raw);

/// The same, but line ends are kept.
std::string onLines(std::string_view raw);

} // namespace kestrum::tools
