#pragma once

#include "support/Bytes.h"
#include "support/Record.h"
#include "support/Value.h"

#include <optional>
#include <unordered_set>

namespace kestrum {

/// The log codes that a client asked for in its start command.
class Subscription {
public:
    /// Reads the lists "SetZephraLogCodes" and "SetVoxExtraCodes" and ignores entries that are no codes. A command
    /// without both lists subscribes to everything.
    explicit Subscription(const Dictionary& command);

    /// True for every message that is no log record (from an IFX modem).
    bool wants(Bytes message) const;

private:
    std::optional<std::unordered_set<LogCode>> _codes; // empty: everything
};

} // namespace kestrum
