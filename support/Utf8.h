#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

/// The character at `at` of a UTF-8 text, which must not be at its end; moves `at` behind it. Nothing, and one byte
/// further, where no valid sequence begins: overlong forms, surrogates and values above U+10FFFF are not valid.
std::optional<char32_t> nextCharacter(std::string_view text, std::size_t& at);

/// Appends a character up to U+10FFFF that is no surrogate.
void appendUtf8(std::string& text, char32_t character);

} // namespace kestrum
