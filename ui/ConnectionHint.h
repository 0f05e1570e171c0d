#pragma once

#include "support/Problem.h"

#include <chrono>
#include <optional>
#include <string>

namespace kestrum {

/// How long a connection may take before an empty root pane says what is missing.
inline constexpr std::chrono::seconds kConnectionPatience{10};

/// The pane's lines then: what it waits for, why it does not come (a sentence), what to do.
std::string connectionHint(const std::optional<Problem>& problem = {});

} // namespace kestrum
