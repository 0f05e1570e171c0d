#include "contracts/Worlds.h"

#include <gmock/gmock.h>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;

template <typename Loop>
class MainQueueContract : public testing::Test {
protected:
    Loop loop;
    MainQueue& queue = loop.queue;
};
using Loops = testing::Types<CrankedLoop, QtLoop>;
TYPED_TEST_SUITE(MainQueueContract, Loops, DoubleOrAdapter);

TYPED_TEST(MainQueueContract, RunsNothingWithinPost)
{
    bool ran = false;
    this->queue.post([&] { ran = true; });
    EXPECT_FALSE(ran);
    EXPECT_TRUE(this->loop.eventually([&] { return ran; }));
}

TYPED_TEST(MainQueueContract, RunsTasksByTheirDelaysAndEqualOnesInTheOrderPosted)
{
    std::vector<int> order;
    this->queue.post(40ms, [&] { order.push_back(4); });
    this->queue.post([&] { order.push_back(1); });
    this->queue.post([&] { order.push_back(2); });
    this->queue.post(20ms, [&] { order.push_back(3); });
    EXPECT_TRUE(this->loop.eventually([&] { return order.size() == 4; }));
    EXPECT_THAT(order, ElementsAre(1, 2, 3, 4));
}

TYPED_TEST(MainQueueContract, ServesTheOthersInAWaitWithinATask)
{
    std::vector<int> order;
    this->queue.post([&] {
        order.push_back(1);
        this->loop.wait(10ms);
        order.push_back(3);
    });
    this->queue.post([&] { order.push_back(2); });
    EXPECT_TRUE(this->loop.eventually([&] { return order.size() == 3; }));
    EXPECT_THAT(order, ElementsAre(1, 2, 3));
}

TYPED_TEST(MainQueueContract, RepeatsUntilTheTimerIsDestroyed)
{
    int ticks = 0;
    auto timer = this->queue.repeat(5ms, [&] { ++ticks; });
    EXPECT_EQ(ticks, 0);
    EXPECT_TRUE(this->loop.eventually([&] { return ticks == 3; }));
    timer.reset();
    this->loop.wait(20ms);
    EXPECT_EQ(ticks, 3);
}

TYPED_TEST(MainQueueContract, ATimerMayEndWithinItsOwnAction)
{
    std::unique_ptr<Timer> timer;
    int ticks = 0;
    const auto held = std::make_shared<int>(7);
    timer = this->queue.repeat(1ms, [&timer, &ticks, held] {
        timer.reset();
        ticks += *held; // still alive
    });
    EXPECT_TRUE(this->loop.eventually([&] { return ticks == 7; }));
    this->loop.wait(10ms);
    EXPECT_EQ(ticks, 7);
}

TYPED_TEST(MainQueueContract, DoesNotRepeatAnActionWithinItself)
{
    int inside = 0, most = 0, ticks = 0;
    const auto timer = this->queue.repeat(1ms, [&] {
        most = std::max(most, ++inside);
        this->loop.wait(10ms);
        --inside;
        ++ticks;
    });
    EXPECT_TRUE(this->loop.eventually([&] { return ticks == 3; }));
    EXPECT_EQ(most, 1);
}

TYPED_TEST(MainQueueContract, DropsTasksAndTimersAndWhatTheyHold)
{
    const auto held = std::make_shared<int>();
    this->queue.post([held] { ADD_FAILURE() << "ran"; });
    const auto timer = this->queue.repeat(1ms, [held] { ADD_FAILURE() << "ran"; });
    this->loop.drop();
    EXPECT_EQ(held.use_count(), 1);
    this->loop.wait(5ms);
}

TYPED_TEST(MainQueueContract, DropsTasksThatArePostedWhileItDrops)
{
    struct PostsAtItsEnd {
        MainQueue& queue;
        ~PostsAtItsEnd()
        {
            queue.post([] { ADD_FAILURE() << "ran"; });
        }
    };
    this->queue.post([last = std::make_shared<PostsAtItsEnd>(this->queue)] { ADD_FAILURE() << "ran"; });
    this->loop.drop();
    this->loop.wait(5ms);
}

TYPED_TEST(MainQueueContract, DroppingWithinATaskStopsTheRest)
{
    bool ran = false;
    this->queue.post([&] {
        this->loop.drop();
        ran = true;
    });
    this->queue.post([] { ADD_FAILURE() << "ran"; });
    EXPECT_TRUE(this->loop.eventually([&] { return ran; }));
    this->loop.wait(5ms);
}

} // namespace
} // namespace kestrum
