#pragma once

#include "platform/SystemLog.h"

#include <algorithm>
#include <functional>
#include <string>
#include <utility>
#include <vector>

namespace kestrum {

/// Stores the lines. Addresses are shown as null unless the test wants them.
class RecordingLog final : public SystemLog {
public:
    using Line = std::pair<Priority, std::string>;

    void write(Priority priority, std::string_view text) override
    {
        lines.emplace_back(priority, text);
        if (const auto run = onWrite) // a copy, because the call may replace it
            run(text);
    }
    const void* shownAddress(const void* address) const override { return showsAddresses ? address : nullptr; }

    std::vector<std::string> texts(Priority priority) const
    {
        std::vector<std::string> found;
        for (const auto& [at, text] : lines)
            if (at == priority)
                found.push_back(text);
        return found;
    }
    std::vector<std::string> errors() const { return texts(Priority::Error); }
    std::size_t count(std::string_view text) const
    {
        return static_cast<std::size_t>(std::ranges::count(lines, text, &Line::second));
    }

    std::vector<Line> lines;
    bool showsAddresses = false;
    std::function<void(std::string_view text)> onWrite; ///< runs after each line
};

} // namespace kestrum
