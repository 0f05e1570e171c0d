#pragma once

#include <string>

namespace kestrum {

/// The reason of a failure, as text for the user. An operation without another result returns std::optional<Problem>;
/// nothing means success.
struct Problem {
    std::string text;

    friend bool operator==(const Problem&, const Problem&) = default;
};

} // namespace kestrum
