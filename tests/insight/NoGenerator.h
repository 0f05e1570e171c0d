#pragma once

#include "LogGenerator/LogGenerator.h"
#include "support/Date.h"

#include <cstddef>
#include <cstdint>
#include <string_view>
#include <vector>

namespace kestrum {

/// A generator that decodes nothing: the test changes the display.
class NoGenerator final : public LogGenerator {
public:
    NoGenerator(DecodingRoles& roles, std::string_view technology) : LogGenerator(roles), name(technology) {}

    std::string_view technology() const override { return name; }
    void updateState(State&, Bytes) override {}
    Value generateLogUsingState(State&) override { return {}; }
    DictionaryRef getStartCommand() const override { return makeDictionary(); }
    ArrayRef getSaveContentsFromState(const State&) const override { return makeArray(); }

    std::string_view name;
};

/// A record without contents.
inline std::vector<std::byte> recordOf(LogCode code, Date time, std::uint8_t type = 1)
{
    std::vector<std::byte> bytes(13);
    const auto put = [&](std::size_t at, std::uint64_t number, std::size_t count) {
        for (std::size_t i = 0; i < count; ++i)
            bytes[at + i] = static_cast<std::byte>(number >> 8 * i);
    };
    put(0, type, 1);
    put(3, code, 2);
    put(5, timeStampFromDate(time), 8);
    return bytes;
}

} // namespace kestrum
