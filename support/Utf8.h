#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

/// Reads the character at `at` (`at` < text.size()) of a UTF-8 text (RFC 3629) and moves `at` behind it. Where no valid
/// sequence begins, gives nothing and moves `at` by one byte. Overlong forms, surrogates and values above U+10FFFF are
/// not valid.
std::optional<char32_t> nextCharacter(std::string_view text, std::size_t& at);

/// The beginning of a UTF-8 text, of at most `most` bytes, that ends between two characters. A text that is not UTF-8 is
/// cut after `most` bytes.
std::string_view beginOf(std::string_view text, std::size_t most);

/// Appends a character. It is at most U+10FFFF and not a surrogate.
void appendUtf8(std::string& text, char32_t character);

} // namespace kestrum
