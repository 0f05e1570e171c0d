#pragma once

#include "support/Bytes.h"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// Bytes as base64 (RFC 4648), padded, on one line.
std::string base64(Bytes bytes);

/// Reads base64; skips blanks, tabs and line ends between the characters. Nothing for a character outside the alphabet,
/// wrong padding, or left-over bits that are not zero.
std::optional<std::vector<std::byte>> bytesFromBase64(std::string_view text);

} // namespace kestrum
