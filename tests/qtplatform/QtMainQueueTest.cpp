#include "platform/qt/QtMainQueue.h"
#include "qtplatform/EventLoop.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

using namespace std::chrono_literals;

TEST(QtMainQueue, RunsATaskNeverBeforeItsTime)
{
    QtMainQueue queue;
    const auto posted = std::chrono::steady_clock::now();
    std::optional<std::chrono::steady_clock::duration> after;
    queue.post(60ms, [&] { after = std::chrono::steady_clock::now() - posted; });
    ASSERT_TRUE(eventually([&] { return after.has_value(); }));
    EXPECT_GE(*after, 60ms);
}

TEST(QtMainQueue, LeavesWhatATaskPostsToTheNextTurnOfTheLoop)
{
    QtMainQueue queue;
    int runs = 0;
    std::function<void()> again = [&] {
        if (++runs < 1000)
            queue.post(again);
    };
    queue.post(again);
    bool timerRan = false;
    QTimer::singleShot(0, [&] { timerRan = true; });
    ASSERT_TRUE(eventually([&] { return timerRan; }));
    EXPECT_LT(runs, 1000);
    EXPECT_TRUE(eventually([&] { return runs == 1000; }));
}

TEST(QtMainQueue, ClearingReleasesAnOwnerThatItsTimerHolds)
{
    struct Owner {
        std::unique_ptr<Timer> timer;
    };
    QtMainQueue queue;
    auto owner = std::make_shared<Owner>();
    owner->timer = queue.repeat(1ms, [owner] { ADD_FAILURE() << "a cleared timer ran"; });
    const std::weak_ptr<Owner> lives = owner;
    owner.reset();
    EXPECT_FALSE(lives.expired());
    queue.clear();
    EXPECT_TRUE(lives.expired());
}

} // namespace
} // namespace kestrum
