// The copies of the displays of the last minutes: complete, shared where nothing changed, bounded.
#include "insight/Moments.h"

#include "LogGenerator/State.h"
#include "core/KestrumModelNode.h"
#include "doubles/VirtualClock.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <chrono>
#include <string>
#include <vector>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::IsEmpty;

Data records(std::size_t bytes)
{
    return Data(std::vector<std::byte>(bytes));
}

class MomentsTest : public testing::Test {
protected:
    /// A refresh with this display, 2 s after the one before.
    void refresh(Moments& moments, const Value& display, const Data& raw = records(3))
    {
        clock.date += 2s;
        moments.displayMade(*makeDictionary({{StateKey::kDisplayState, raw},
                                             {StateKey::kDisplay, shallowCopy(display)},
                                             {StateKey::kExtraInfo, makeDictionary()},
                                             {StateKey::kDate, dateText(clock.now())}}));
    }
    void refresh(const Value& display) { refresh(moments, display); }

    static Value display(const std::string& level)
    {
        return makeDictionary({{"Serving", makeDictionary({{"RSRP", level}, {"PCI", "101"}})},
                               {"Neighbours", makeArray({makeDictionary({{"PCI", "7"}})})}});
    }
    /// The displays, oldest first.
    static std::vector<Value> displays(const Moments& moments)
    {
        std::vector<Value> all;
        for (auto each = moments.newest(); each; each = moments.before(*each))
            all.insert(all.begin(), each->display());
        return all;
    }

    VirtualClock clock;
    Moments moments{clock};
};

TEST_F(MomentsTest, HoldsEachDisplayAsItWas)
{
    const Value live = display("-80 dBm");
    refresh(live);
    live.dictionary()->at("Serving").dictionary()->set("RSRP", "-81 dBm"); // in place, as sections do
    live.dictionary()->at("Neighbours").array()->appendRow().set("PCI", "8");
    refresh(live);
    live.dictionary()->set("More", "text");
    refresh(live);
    live.dictionary()->remove("Serving");
    refresh(live);

    const auto all = displays(moments);
    ASSERT_EQ(all.size(), 4u);
    EXPECT_EQ(describe(all[0]), R"({"Serving": {"RSRP": "-80 dBm", "PCI": "101"}, "Neighbours": [{"PCI": "7"}]})");
    EXPECT_EQ(describe(all[1]),
              R"({"Serving": {"RSRP": "-81 dBm", "PCI": "101"}, "Neighbours": [{"PCI": "7"}, {"PCI": "8"}]})");
    EXPECT_EQ(
        describe(all[2]),
        R"({"Serving": {"RSRP": "-81 dBm", "PCI": "101"}, "Neighbours": [{"PCI": "7"}, {"PCI": "8"}], "More": "text"})");
    EXPECT_EQ(describe(all[3]), R"({"Neighbours": [{"PCI": "7"}, {"PCI": "8"}], "More": "text"})");
}

TEST_F(MomentsTest, NoticesAKeyThatTookTheNameOfAnother)
{
    refresh(makeDictionary({{"A", Value()}, {"B", "1"}}));
    refresh(makeDictionary({{"C", Value()}, {"B", "1"}}));
    refresh(makeDictionary({{"B", "1"}, {"C", Value()}}));
    EXPECT_THAT(displays(moments),
                ElementsAre(makeDictionary({{"A", Value()}, {"B", "1"}}), makeDictionary({{"C", Value()}, {"B", "1"}}),
                            makeDictionary({{"B", "1"}, {"C", Value()}})));
}

TEST_F(MomentsTest, SharesWhatHasNotChanged)
{
    refresh(display("-80 dBm"));
    refresh(display("-81 dBm"));
    const auto all = displays(moments);
    const auto at = [&](std::size_t moment, const char* key) { return all[moment].dictionary()->at(key); };
    EXPECT_EQ(at(0, "Neighbours").array(), at(1, "Neighbours").array());
    EXPECT_NE(at(0, "Serving").dictionary(), at(1, "Serving").dictionary());
}

TEST_F(MomentsTest, NeverSharesWithTheLiveDisplay)
{
    const Value live = display("-80 dBm");
    refresh(live);
    refresh(live);
    for (const auto& each : displays(moments)) {
        EXPECT_NE(each.dictionary(), live.dictionary());
        EXPECT_NE(each.dictionary()->at("Serving").dictionary(), live.dictionary()->at("Serving").dictionary());
        EXPECT_NE(each.dictionary()->at("Neighbours").array(), live.dictionary()->at("Neighbours").array());
    }
}

TEST_F(MomentsTest, GoesBackAndForthByOneRefresh)
{
    EXPECT_FALSE(moments.newest());
    for (const char* each : {"-80", "-81", "-82"})
        refresh(display(each));
    const auto last = moments.newest().value();
    EXPECT_EQ(last.time, clock.now());
    EXPECT_FALSE(moments.after(last));
    const auto middle = moments.before(last).value();
    EXPECT_EQ(middle.time, clock.now() - 2s);
    EXPECT_EQ(middle.display(), display("-81"));
    const auto first = moments.before(middle).value();
    EXPECT_FALSE(moments.before(first));
    EXPECT_EQ(moments.after(first)->number, middle.number);
}

TEST_F(MomentsTest, KeepsTheOrderWhenTheClockJumpsBack)
{
    refresh(display("-80"));
    clock.date -= 1h;
    refresh(display("-81"));
    const auto newest = moments.newest().value();
    EXPECT_EQ(newest.display(), display("-81"));
    const auto before = moments.before(newest).value();
    EXPECT_EQ(before.display(), display("-80"));
    EXPECT_GT(before.time, newest.time);
}

TEST_F(MomentsTest, KeepsFifteenMinutes)
{
    for (int i = 0; i < 1000; ++i)
        refresh(display(std::to_string(i)));
    EXPECT_EQ(moments.size(), 450u);
    EXPECT_EQ(displays(moments).front(), display("550"));
}

TEST_F(MomentsTest, MomentThatIsHeldOutlivesTheOthers)
{
    refresh(display("-80"));
    const auto held = moments.newest().value();
    for (int i = 0; i < 1000; ++i)
        refresh(display(std::to_string(i)));
    EXPECT_EQ(held.display(), display("-80"));
    EXPECT_FALSE(moments.before(held));
    EXPECT_EQ(moments.after(held)->display(), display("550")) << "the oldest that is left";
}

TEST_F(MomentsTest, GivesTheEntriesThatASnapshotOfThatMomentHeld)
{
    for (const char* each : {"-80", "-81", "-82", "-83"})
        refresh(display(each));
    const auto third = moments.before(moments.newest().value()).value();
    const auto texts = [&](const Moment& last, std::size_t count) {
        std::vector<Value> all;
        const auto entries = moments.entriesUpTo(last, count);
        for (const auto& each : *entries)
            all.push_back(each.dictionary()->at(StateKey::kDisplay));
        return all;
    };
    EXPECT_THAT(texts(third, 2), ElementsAre(display("-81"), display("-82")));
    EXPECT_THAT(texts(third, 5), ElementsAre(display("-80"), display("-81"), display("-82")));
}

// Memory

TEST_F(MomentsTest, CountsAnUnchangedDisplayOnce)
{
    Value large = makeArray();
    for (int i = 0; i < 10'000; ++i)
        large.array()->appendRow().set("RSRP", "a text that does not fit into the string itself");
    refresh(makeDictionary({{"Cells", large}, {"Beat", "0"}}));
    const std::size_t one = moments.bytes();
    EXPECT_GT(one, 1u << 20);
    for (int i = 0; i < 100; ++i)
        refresh(makeDictionary({{"Cells", large}, {"Beat", std::to_string(i)}}));
    EXPECT_LT(moments.bytes() - one, 100u << 10) << "the same cells are kept once";
}

TEST_F(MomentsTest, StaysWithinItsBytesWithADisplayThatChangesShapeAtEachRefresh)
{
    Moments small(clock, {.moments = 450, .bytes = 1 << 20});
    for (int i = 0; i < 500; ++i) {
        auto shape = makeDictionary();
        for (int key = 0; key < 1 + i * 7 % 400; ++key)
            shape->set("key " + std::to_string(i * 1000 + key),
                       i % 3 == 0 ? Value(makeDictionary({{"a", "b"}})) : Value("a text on the heap, rather long"));
        refresh(small, shape);
        ASSERT_LE(small.bytes(), 1u << 20);
        ASSERT_GT(small.size(), 0u);
        ASSERT_EQ(small.newest()->display(), shape);
    }
}

TEST_F(MomentsTest, CountComesBackToNothing)
{
    Moments small(clock, {.moments = 3, .bytes = 1 << 20});
    refresh(small, display("-80"));
    const std::size_t one = small.bytes();
    for (int i = 0; i < 1000; ++i)
        refresh(small, display(std::to_string(i % 10)), records(static_cast<std::size_t>(i)));
    for (int i = 0; i < 3; ++i)
        refresh(small, display("-80"));
    EXPECT_LT(small.bytes(), 3 * one);
    refresh(small, Value(std::string(2 << 20, 'x'))); // larger than everything that may be kept
    EXPECT_EQ(small.size(), 0u);
    EXPECT_EQ(small.bytes(), 0u);
    refresh(small, display("-80"));
    EXPECT_EQ(small.size(), 1u);
    EXPECT_EQ(small.bytes(), one);
}

TEST_F(MomentsTest, DropsTheOldestRawRecordsBeforeAnyDisplay)
{
    Moments small(clock, {.moments = 450, .bytes = 1 << 20});
    refresh(small, display("held"), records(300'000));
    const auto held = small.newest().value();
    for (int i = 0; i < 100; ++i)
        refresh(small, display(std::to_string(i)), records(300'000));
    EXPECT_EQ(small.size(), 101u);
    EXPECT_LE(small.bytes(), 1u << 20);
    const auto rawOf = [](const Moment& moment) { return moment.entry->at(StateKey::kDisplayState).data()->size(); };
    const auto newest = small.newest().value();
    EXPECT_EQ(rawOf(newest), 300'000u);
    EXPECT_EQ(rawOf(small.before(newest).value()), 300'000u);
    EXPECT_EQ(rawOf(*small.after(held)), 0u);
    EXPECT_EQ(rawOf(held), 300'000u) << "a moment that is held stays whole";
}

TEST_F(MomentsTest, CopiesADeepDisplayOnceForAChangeAtItsBottom)
{
    // A comparison of each level with all levels below it would take minutes.
    const auto deep = [](const char* bottom) {
        auto inner = makeDictionary();
        for (int i = 0; i < 20'000; ++i)
            inner->set("key " + std::to_string(i), "same");
        inner->set("last", bottom);
        Value value = inner;
        for (int level = 0; level < 500; ++level)
            value = makeDictionary({{"below", value}, {"beside", "same"}});
        return value;
    };
    refresh(deep("one"));
    refresh(deep("two"));
    EXPECT_EQ(moments.size(), 2u);
    EXPECT_LT(moments.bytes(), 32u << 20);
}

} // namespace
} // namespace kestrum
