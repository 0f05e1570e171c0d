#include "frontends/ReusePool.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

std::shared_ptr<ReusableCell> cell(std::string_view identifier = "row")
{
    return std::make_shared<ReusableCell>(nullptr, identifier);
}

TEST(ReusePool, RowGetsTheCellBackThatLastShowedIt)
{
    ReusePool pool(0);
    const auto first = cell(), second = cell();
    pool.put(1, first);
    pool.put(2, second);
    EXPECT_EQ(pool.take(2, "row"), second);
    EXPECT_EQ(pool.take(1, "row"), first);
    EXPECT_EQ(pool.take(1, "row"), nullptr);
}

TEST(ReusePool, CellsOfOtherIdentifiersAreNotOffered)
{
    ReusePool pool(0);
    pool.put(1, cell("other"));
    EXPECT_EQ(pool.take(1, "row"), nullptr);
    EXPECT_NE(pool.take(1, "other"), nullptr);
}

TEST(ReusePool, RowWithoutACellGetsNoneWhileFewWait)
{
    ReusePool pool;
    pool.put(1, cell());
    EXPECT_EQ(pool.take(40, "row"), nullptr);
}

TEST(ReusePool, RowWithoutACellGetsTheTopmostOneWhenManyWait)
{
    ReusePool pool(2);
    const auto topmost = cell();
    pool.put(7, cell());
    pool.put(3, topmost);
    EXPECT_EQ(pool.take(40, "row"), nullptr);
    pool.put(5, cell());
    EXPECT_EQ(pool.take(40, "row"), topmost);
}

} // namespace
} // namespace kestrum
