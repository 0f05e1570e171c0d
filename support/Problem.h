#pragma once

#include <string>

namespace kestrum {

/// Why something failed, in words for a person. An operation that gives nothing else returns std::optional<Problem>:
/// nothing on success.
struct Problem {
    std::string text;

    friend bool operator==(const Problem&, const Problem&) = default;
};

} // namespace kestrum
