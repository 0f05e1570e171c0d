#pragma once

#include <chrono>
#include <string>
#include <string_view>

namespace kestrum {

/// How long a connection may take before an empty root pane says what is missing.
inline constexpr std::chrono::seconds kConnectionPatience{10};

/// What the pane says then, in lines: what is waited for, why it does not come (a sentence, or nothing), what to do.
std::string connectionHint(std::string_view reason = {});

} // namespace kestrum
