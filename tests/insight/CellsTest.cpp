#include "insight/Cells.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

constexpr Date kStart{std::chrono::sys_days(std::chrono::year(2026) / 11 / 16)};

TEST(Cells, ACellIsKnownAgainByRadioAndKey)
{
    Cells cells;
    Cells::leave(cells.enter("LTE", "7", kStart), kStart + 3s);
    Cells::leave(cells.enter("GSM", "7", kStart + 3s), kStart + 4s);
    Cells::leave(cells.enter("LTE", "7", kStart + 4s), kStart + 9s);
    ASSERT_EQ(cells.size(), 2u);
    EXPECT_EQ(cells.begin()->radio, "LTE");
    EXPECT_EQ(cells.begin()->visits, 2u);
    EXPECT_EQ(cells.begin()->time, 8s);
    EXPECT_EQ(cells.begin()->lastSeen, kStart + 9s);
}

TEST(Cells, ABackwardClockAddsNoTime)
{
    Cells cells;
    auto& cell = cells.enter("LTE", "7", kStart);
    cell.count(kStart - 1h, kStart - 1h);
    Cells::leave(cell, kStart - 1h + 2s);
    EXPECT_EQ(cell.time, 2s);
}

TEST(Cells, WithoutTimesVisitsAreCountedStill)
{
    Cells cells;
    Cells::leave(cells.enter("LTE", "7", {}), {});
    EXPECT_EQ(cells.begin()->visits, 1u);
    EXPECT_EQ(cells.begin()->time, 0s);
    EXPECT_FALSE(cells.begin()->lastSeen);
}

// CDMA has two serving cells: one may stay while the other changes thousands of times.
TEST(Cells, ACellThatServesIsNotDropped)
{
    Cells cells;
    auto& stays = cells.enter("1x", "7", kStart);
    for (std::size_t i = 0; i < Cells::kMost + 5; ++i)
        Cells::leave(cells.enter("EV-DO", std::to_string(i), kStart), kStart);
    EXPECT_EQ(cells.size(), Cells::kMost);
    EXPECT_EQ(cells.dropped(), 6u);
    EXPECT_EQ(stays.key, "7");
    EXPECT_EQ(&*std::prev(cells.end()), &stays);
    Cells::leave(stays, kStart + 1s);
    EXPECT_EQ(cells.enter("1x", "7", kStart + 2s).visits, 2u);
    EXPECT_EQ(&*cells.begin(), &stays);
}

} // namespace
} // namespace kestrum
