#pragma once

#include "support/Bytes.h"
#include "support/Record.h"
#include "support/Value.h"

#include <optional>
#include <unordered_set>

namespace kestrum {

/// What a client asked for in its start command.
class Subscription {
public:
    /// From the lists "SetZephraLogCodes" and "SetVoxExtraCodes"; what is no code in them is left out. A command
    /// without both asks for everything.
    explicit Subscription(const Dictionary& command);

    /// Messages that are no log records (an IFX modem's) are wanted by all.
    bool wants(Bytes message) const;

private:
    std::optional<std::unordered_set<LogCode>> _codes; // nothing: everything
};

} // namespace kestrum
