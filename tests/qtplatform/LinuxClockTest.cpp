#include "platform/qt/LinuxClock.h"
#include "harness/Scratch.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

using namespace std::chrono;
using namespace std::chrono_literals;

// 2026-11-16 06:05:42 UTC
constexpr Date kNovember = sys_days(year{2026} / 11 / 16) + 6h + 5min + 42s;
constexpr Date kJuly = sys_days(year{2026} / 7 / 1) + 12h;

TEST(LinuxClock, GivesTheOffsetEastOfUtcAndDaylightSaving)
{
    const ScopedVariable zone("TZ", "America/St_Johns");
    const LinuxClock clock;
    EXPECT_EQ(clock.zoneAt(kNovember).offset, -(3h + 30min));
    EXPECT_FALSE(clock.zoneAt(kNovember).daylightSaving);
    EXPECT_EQ(clock.zoneAt(kJuly).offset, -(2h + 30min));
    EXPECT_TRUE(clock.zoneAt(kJuly).daylightSaving);
}

TEST(LinuxClock, WritesLocalDatesByThePattern)
{
    const ScopedVariable zone("TZ", "Asia/Kolkata");
    const LinuxClock clock;
    EXPECT_EQ(clock.localText(kNovember, "'Updated' yyyy-MM-dd 'at' HH:mm:ss"), "Updated 2026-11-16 at 11:35:42");
}

TEST(LinuxClock, RunsWithTheSystems)
{
    const auto before = floor<microseconds>(system_clock::now());
    const auto now = LinuxClock().now();
    const auto after = system_clock::now();
    EXPECT_GE(now, before);
    EXPECT_LE(now, after);
}

} // namespace
} // namespace kestrum
