#include "platform/qt/QtMainQueue.h"
#include "qtplatform/EventLoop.h"

#include <QEventLoop>

#include <gmock/gmock.h>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;

TEST(QtMainQueue, RunsNothingWithinPost)
{
    QtMainQueue queue;
    bool ran = false;
    queue.post([&] { ran = true; });
    EXPECT_FALSE(ran);
    EXPECT_TRUE(eventually([&] { return ran; }));
}

TEST(QtMainQueue, RunsTasksByTheirDelaysAndEqualOnesInTheOrderPosted)
{
    QtMainQueue queue;
    std::vector<int> order;
    queue.post(40ms, [&] { order.push_back(4); });
    queue.post([&] { order.push_back(1); });
    queue.post([&] { order.push_back(2); });
    queue.post(20ms, [&] { order.push_back(3); });
    EXPECT_TRUE(eventually([&] { return order.size() == 4; }));
    EXPECT_THAT(order, ElementsAre(1, 2, 3, 4));
}

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

TEST(QtMainQueue, ServesTheOthersInALoopWithinATask)
{
    QtMainQueue queue;
    std::vector<int> order;
    queue.post([&] {
        order.push_back(1);
        QEventLoop inner;
        queue.post([&] {
            order.push_back(3);
            inner.quit();
        });
        inner.exec();
        order.push_back(4);
    });
    queue.post([&] { order.push_back(2); });
    EXPECT_TRUE(eventually([&] { return order.size() == 4; }));
    EXPECT_THAT(order, ElementsAre(1, 2, 3, 4));
}

TEST(QtMainQueue, RepeatsUntilTheTimerGoes)
{
    QtMainQueue queue;
    int runs = 0;
    auto timer = queue.repeat(1ms, [&] { ++runs; });
    ASSERT_TRUE(eventually([&] { return runs >= 3; }));
    timer.reset();
    const int before = runs;
    bool later = false;
    queue.post(20ms, [&] { later = true; });
    ASSERT_TRUE(eventually([&] { return later; }));
    EXPECT_EQ(runs, before);
}

TEST(QtMainQueue, SurvivesATimerThatEndsWithinItsOwnAction)
{
    QtMainQueue queue;
    int runs = 0;
    std::unique_ptr<Timer> timer;
    auto captured = std::make_shared<int>(7);
    timer = queue.repeat(1ms, [&runs, &timer, captured] {
        timer.reset();
        runs += *captured; // what the action holds is still there
    });
    captured.reset();
    bool later = false;
    queue.post(30ms, [&] { later = true; });
    ASSERT_TRUE(eventually([&] { return later; }));
    EXPECT_EQ(runs, 7);
}

TEST(QtMainQueue, DoesNotRepeatAnActionWithinItself)
{
    QtMainQueue queue;
    int depth = 0, deepest = 0, runs = 0;
    const auto timer = queue.repeat(1ms, [&] {
        deepest = std::max(deepest, ++depth);
        QEventLoop inner;
        queue.post(10ms, [&] { inner.quit(); });
        inner.exec();
        --depth;
        ++runs;
    });
    ASSERT_TRUE(eventually([&] { return runs == 2; }));
    EXPECT_EQ(deepest, 1);
}

TEST(QtMainQueue, ClearingDropsTasksAndTimersAndWhatTheyHold)
{
    QtMainQueue queue;
    const auto held = std::make_shared<int>(0);
    queue.post([held] { ++*held; });
    queue.post(1h, [held] { ++*held; });
    const auto timer = queue.repeat(1ms, [] { ADD_FAILURE() << "a cleared timer ran"; });
    queue.clear();
    EXPECT_EQ(held.use_count(), 1);
    bool later = false;
    queue.post(10ms, [&] { later = true; });
    EXPECT_TRUE(eventually([&] { return later; }));
    EXPECT_EQ(*held, 0);
}

TEST(QtMainQueue, ClearingLetsGoOfAnOwnerThatItsOwnTimerHolds)
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

TEST(QtMainQueue, ClearingDropsWhatItsTasksPostAsTheyGo)
{
    QtMainQueue queue;
    struct PostsAtItsEnd {
        QtMainQueue& queue;
        ~PostsAtItsEnd()
        {
            queue.post([] { ADD_FAILURE() << "ran"; });
        }
    };
    queue.post([last = std::make_shared<PostsAtItsEnd>(queue)] {});
    queue.clear();
    bool later = false;
    queue.post(5ms, [&] { later = true; });
    EXPECT_TRUE(eventually([&] { return later; }));
}

TEST(QtMainQueue, ClearingWithinATaskStopsTheRest)
{
    QtMainQueue queue;
    bool cleared = false;
    queue.post([&] {
        queue.clear();
        cleared = true;
    });
    queue.post([] { ADD_FAILURE() << "ran after clear"; });
    EXPECT_TRUE(eventually([&] { return cleared; }));
    bool later = false;
    queue.post([&] { later = true; });
    EXPECT_TRUE(eventually([&] { return later; }));
}

} // namespace
} // namespace kestrum
