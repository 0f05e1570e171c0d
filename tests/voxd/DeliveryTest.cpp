#include "voxd/Outbox.h"
#include "voxd/Subscription.h"

#include <gmock/gmock.h>

namespace kestrum {
namespace {

using namespace std::string_literals;

const std::string kServingCell = "\x01\x0C\0\xC2\xB0........"s; // 0xB0C2
const std::string kSearcher = "\x01\x0C\0\x7A\x41........"s;    // 0x417A
const std::string kCellMonitor = "\xFF\x0C\0\x01\0........"s;   // 0xFF0001
const std::string kNotTheMonitor = "\x01\x0C\0\x01\0........"s; // 0x0001
const std::string kPropertyList = "<?xml version=\"1.0\"?>";

TEST(Subscription, WithoutCodesWantsEverything)
{
    const Subscription all{Dictionary{{"SetState", Value("Streaming")}}};
    for (const auto& each : {kServingCell, kCellMonitor, kPropertyList})
        EXPECT_TRUE(all.wants(bytesOf(each)));
}

TEST(Subscription, WantsTheCodesOfItsTwoLists)
{
    const Subscription some{Dictionary{{"SetState", Value("Streaming")},
                                       {"SetZephraLogCodes", makeArray({Value(0xB0C2)})},
                                       {"SetVoxExtraCodes", makeArray({Value(1)})}}};
    EXPECT_TRUE(some.wants(bytesOf(kServingCell)));
    EXPECT_TRUE(some.wants(bytesOf(kCellMonitor)));
    EXPECT_FALSE(some.wants(bytesOf(kSearcher)));
    EXPECT_FALSE(some.wants(bytesOf(kNotTheMonitor))) << "extra code 1 is not log code 1";
    EXPECT_TRUE(some.wants(bytesOf("\x81\xAA"s + kServingCell))) << "behind a prefix";
}

TEST(Subscription, ToEmptyListsWantsNoRecord)
{
    const Subscription none{Dictionary{{"SetZephraLogCodes", makeArray({})}, {"SetVoxExtraCodes", makeArray({})}}};
    EXPECT_FALSE(none.wants(bytesOf(kServingCell)));
    EXPECT_FALSE(none.wants(bytesOf(kCellMonitor)));
    EXPECT_TRUE(none.wants(bytesOf(kPropertyList))) << "it has no code to choose by";
}

TEST(Subscription, LeavesOutWhatIsNoCode)
{
    const Subscription some{Dictionary{
        {"SetZephraLogCodes", makeArray({Value("0xB0C2"), Value(-1), Value(0x1B0C2), Value(true), Value(0x417A)})}}};
    EXPECT_TRUE(some.wants(bytesOf(kSearcher)));
    EXPECT_FALSE(some.wants(bytesOf(kServingCell)));
}

Data message(std::string_view text)
{
    return Data(bytesOf(text));
}

std::string take(Outbox& outbox)
{
    const auto taken = outbox.take();
    return taken ? std::string(textOf(taken->bytes())) : "nothing";
}

TEST(Outbox, GivesMessagesInTheirOrder)
{
    Outbox outbox(10'000);
    outbox.add(message("one"));
    outbox.add(message("two"));
    EXPECT_EQ(take(outbox), "one");
    EXPECT_EQ(take(outbox), "two");
    EXPECT_EQ(take(outbox), "nothing");
    EXPECT_EQ(outbox.held(), 0u);
    EXPECT_EQ(outbox.dropped(), 0u);
}

TEST(Outbox, DropsTheOldestWholeMessagesAtItsBoundAndCountsThem)
{
    Outbox outbox(1000);
    for (int i = 0; i < 10; ++i)
        outbox.add(message(std::string(200, static_cast<char>('0' + i))));
    EXPECT_LE(outbox.held(), 1000u);
    EXPECT_EQ(outbox.dropped(), 7u); // 3 messages of 200 bytes and their overhead stay
    for (const char each : {'7', '8', '9'})
        EXPECT_EQ(take(outbox), std::string(200, each));
    EXPECT_EQ(take(outbox), "nothing");
}

TEST(Outbox, IsBoundedForEmptyMessagesToo)
{
    Outbox outbox(1000);
    for (int i = 0; i < 100'000; ++i)
        outbox.add(message(""));
    EXPECT_LE(outbox.held(), 1000u);
    EXPECT_GE(outbox.dropped(), 99'900u);
}

TEST(Outbox, DropsAMessageThatIsLargerThanItsBound)
{
    Outbox outbox(1000);
    outbox.add(message("small"));
    outbox.add(message(std::string(2000, 'x')));
    EXPECT_EQ(outbox.dropped(), 2u);
    outbox.add(message("next"));
    EXPECT_EQ(take(outbox), "next");
}

TEST(Outbox, SharesTheBytesOfItsMessages)
{
    const auto shared = message("for several clients");
    Outbox outbox(1000);
    outbox.add(shared);
    EXPECT_TRUE(outbox.take()->sharesStorageWith(shared));
}

} // namespace
} // namespace kestrum
