#pragma once

#include "platform/Console.h"

#include <string>
#include <vector>

namespace kestrum {

/// Stores the printed text.
class RecordingConsole final : public Console {
public:
    void printLine(std::string_view line) override { printed.emplace_back(line); }
    void debug(std::string_view line) override { debugged.emplace_back(line); }
    bool isDebugWatched() const override { return true; }

    std::vector<std::string> printed, debugged;
};

} // namespace kestrum
