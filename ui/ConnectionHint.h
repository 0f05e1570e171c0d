#pragma once

#include "support/Problem.h"

#include <chrono>
#include <optional>
#include <string>

namespace kestrum {

/// An empty root pane shows the hint when the connection takes longer than this.
inline constexpr std::chrono::seconds kConnectionPatience{10};

/// The pane's lines then: what it waits for, why it does not come (a sentence), what to do.
std::string connectionHint(const std::optional<Problem>& problem = {});

} // namespace kestrum
