#pragma once

#include "support/Problem.h"

#include <chrono>
#include <optional>
#include <string>

namespace kestrum {

/// An empty root pane shows the hint when the connection takes longer than this.
inline constexpr std::chrono::seconds kConnectionPatience{10};

/// The hint, in lines: what the display waits for, `problem` (a sentence), what the user can do.
std::string connectionHint(const std::optional<Problem>& problem = {});

} // namespace kestrum
