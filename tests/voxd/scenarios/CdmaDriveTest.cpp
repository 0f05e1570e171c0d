#include "voxd/scenarios/ScenarioRun.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <charconv>
#include <set>
#include <string>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

std::uint32_t wordAt(const Source::Message& message, std::size_t offset)
{
    const std::size_t prefix = message.bytes[0] == std::byte{0x81} ? 2 : 0;
    std::uint32_t word = 0;
    for (std::size_t i = 4; i-- > 0;)
        word = (word << 8) | std::to_integer<std::uint32_t>(message.bytes.at(prefix + offset + i));
    return word;
}

TEST(CdmaDrive, PacketCountersAndSequenceNumbersNeverShrink)
{
    ScenarioRun run("cdma");
    std::vector<std::uint32_t> forward(57), reverse(434);
    std::uint64_t grown = 0;
    run.decodeFor(4min, [&] {
        if (run.code != 0x1192 && run.code != 0x127E)
            return;
        auto& last = run.code == 0x1192 ? forward : reverse;
        const std::size_t first = run.code == 0x1192 ? 13 : 14;
        for (std::size_t i = 0; i < last.size(); ++i) {
            const auto now = wordAt(run.message, first + 4 * i);
            ASSERT_GE(now, last[i]) << i;
            grown += now - last[i];
            last[i] = now;
        }
    });
    EXPECT_GT(grown, 10000u);
}

TEST(CdmaDrive, DataRatesAreThoseOfALink)
{
    ScenarioRun run("cdma");
    double fastest = 0;
    int idle = 0;
    run.decodeFor(4min, [&] {
        for (const auto& [code, key] :
             {std::pair(0x1192u, "4;Forward Link Rate"), std::pair(0x127Eu, "5;Reverse Link Rate")})
            if (run.code == code) {
                const auto text = textAt(run.display(), "0;EV-DO", key);
                if (text.empty())
                    continue;
                EXPECT_TRUE(text.ends_with(" kbps")) << text;
                double rate = -1;
                std::from_chars(text.data(), text.data() + text.size(), rate);
                EXPECT_GE(rate, 0);
                EXPECT_LE(rate, code == 0x1192 ? 2457.6 : 1843.2);
                fastest = std::max(fastest, rate);
                idle += rate == 0;
            }
    });
    EXPECT_GT(fastest, 200);
    EXPECT_GT(idle, 30);
}

TEST(CdmaDrive, TheServingPilotLeadsTheActiveSet)
{
    ScenarioRun run("cdma");
    std::set<std::string> serving;
    int compared = 0;
    run.decodeFor(4min, [&] {
        if (run.code != 0x12B6)
            return;
        const auto offset = textAt(run.display(), "1;Radio", "2;Serving PN Offset");
        const auto pilots = nodeNamed("2;Active Set Pilots", run.display()).dictionary();
        ASSERT_TRUE(pilots);
        for (const auto& [key, value] : *pilots)
            if (key.starts_with("0;")) {
                EXPECT_TRUE(offset.starts_with(key.substr(2) + " ")) << offset << key;
                EXPECT_EQ(std::stoi(key.substr(2)) % 4, 0);
                ++compared;
            }
        serving.insert(offset);
    });
    EXPECT_GT(compared, 3000);
    EXPECT_GE(serving.size(), 5u);
}

TEST(CdmaDrive, FrameErrorsAreCountedDuringCallsAndOldAfterwards)
{
    ScenarioRun run("cdma");
    bool fresh = false, old = false;
    std::set<std::string> states;
    run.decodeFor(4min, [&] {
        const auto text = textAt(run.display(), "1;1x", "3;Traffic FER");
        fresh |= text.ends_with("%");
        old |= text.ends_with(" (old)");
        if (run.code == 0x119D) {
            EXPECT_EQ(textAt(run.display(), "1;1x", "0;Device State"), "Traffic [8]");
        }
        states.insert(textAt(run.display(), "1;1x", "0;Device State"));
    });
    EXPECT_TRUE(fresh);
    EXPECT_TRUE(old);
    for (const char* state :
         {"Acquisition [3]", "Sync [4]", "Paging [6]", "Slotted mode sleep state [7]", "Traffic [8]"})
        EXPECT_TRUE(states.contains(state)) << state;
}

} // namespace
} // namespace kestrum
