#include "LogGenerator/ArrayLock.h"

#include "LogGenerator/Base.h"
#include "doubles/CountedArrayLock.h"

#include <gtest/gtest.h>

#include <thread>

namespace kestrum {
namespace {

class ArrayLockCounts : public testing::Test {
protected:
    CountedArrayLock counts;
};

TEST_F(ArrayLockCounts, APairLocksAndUnlocks)
{
    ArrayLock::lockArray();
    EXPECT_EQ(counts.locked, 1);
    EXPECT_EQ(counts.unlocked, 0);
    ArrayLock::unlockArray();
    EXPECT_EQ(counts.unlocked, 1);
}

TEST_F(ArrayLockCounts, NestedPairLocksTwiceAndUnlocksOnce)
{
    ArrayLock::lockArray();
    ArrayLock::lockArray();
    ArrayLock::unlockArray();
    EXPECT_EQ(counts.unlocked, 0);
    ArrayLock::unlockArray();
    EXPECT_EQ(counts.locked, 2);
    EXPECT_EQ(counts.unlocked, 1);
}

TEST_F(ArrayLockCounts, UseContinuesAfterANestedPair)
{
    ArrayLock::lockArray();
    ArrayLock::lockArray();
    ArrayLock::unlockArray();
    ArrayLock::unlockArray();
    ArrayLock::lockArray();
    ArrayLock::unlockArray();
    EXPECT_EQ(counts.locked, 3);
    EXPECT_EQ(counts.unlocked, 2);
}

TEST_F(ArrayLockCounts, DepthWrapsAtEightBits)
{
    // After 256 locks the depth is 0, and the first unlock changes it to 255.
    for (int i = 0; i < 256; ++i)
        ArrayLock::lockArray();
    for (int i = 0; i < 255; ++i)
        ArrayLock::unlockArray();
    EXPECT_EQ(counts.locked, 256);
    EXPECT_EQ(counts.unlocked, 0);
    ArrayLock::unlockArray();
    EXPECT_EQ(counts.unlocked, 1);
}

TEST_F(ArrayLockCounts, OneLockBeyondTheWrapIsUnlockedAtTheFirstUnlock)
{
    for (int i = 0; i < 257; ++i)
        ArrayLock::lockArray();
    ArrayLock::unlockArray();
    EXPECT_EQ(counts.unlocked, 1);
    for (int i = 0; i < 256; ++i)
        ArrayLock::unlockArray();
    EXPECT_EQ(counts.unlocked, 2);
}

TEST_F(ArrayLockCounts, ScopeHoldsItForItsLength)
{
    {
        const ArrayLocked locked;
        EXPECT_EQ(counts.locked, 1);
        EXPECT_EQ(counts.unlocked, 0);
    }
    EXPECT_EQ(counts.unlocked, 1);
}

TEST(ArrayLock, NestedUseNeverBlocksTheOneThread)
{
    ArrayLock::initialize(std::make_unique<StandardRecursiveMutex>());
    for (int i = 0; i < 1000; ++i) {
        const ArrayLocked outer;
        const ArrayLocked inner;
    }
    SUCCEED();
    ArrayLock::initialize(std::make_unique<StandardRecursiveMutex>());
}

#ifndef NDEBUG
TEST(ArrayLockDeathTest, SecondThreadIsRefusedInADebugBuild)
{
    testing::FLAGS_gtest_death_test_style = "threadsafe";
    EXPECT_DEATH(
        {
            ArrayLock::lockArray();
            ArrayLock::unlockArray();
            std::thread([] { ArrayLock::lockArray(); }).join();
        },
        "one thread decodes in a process");
}
#endif

// The array changes between lock and unlock, not before or after.

class RewriteUnderTheLock : public testing::Test {
protected:
    RewriteUnderTheLock()
    {
        counts.onLock = [this] { atLock = Value(deepCopy(node)); };
        counts.onUnlock = [this] { atUnlock = Value(deepCopy(node)); };
    }

    ArrayRef node = makeArray({"a", "b"});
    CountedArrayLock counts;
    Value atLock, atUnlock;
};

TEST_F(RewriteUnderTheLock, RemovesTheElements)
{
    Base::clearElementsInArray(SectionRef(node));
    EXPECT_EQ(atLock, Value(makeArray({"a", "b"})));
    EXPECT_EQ(atUnlock, Value(makeArray()));
}

TEST_F(RewriteUnderTheLock, ReplacesTheElements)
{
    Base::replaceArray(SectionRef(node), {"c"});
    EXPECT_EQ(atLock, Value(makeArray({"a", "b"})));
    EXPECT_EQ(atUnlock, Value(makeArray({"c"})));
    EXPECT_EQ(counts.locked, 1);
}

} // namespace
} // namespace kestrum
