#pragma once

#include "support/Bytes.h"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// Bytes as base64 (RFC 4648), padded, on one line.
std::string base64(Bytes bytes);

/// Reads base64; blanks, tabs and line ends between the characters do not count. Nothing for a character outside the
/// alphabet, wrong padding, or bits that no byte takes.
std::optional<std::vector<std::byte>> bytesFromBase64(std::string_view text);

} // namespace kestrum
