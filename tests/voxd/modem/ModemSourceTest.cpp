#include "ModemFixture.h"

#include "platform/TelephonyService.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "voxd/modem/ModemSource.h"

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using Fake = FakeModemManager;

class ModemSourceTest : public ModemManagerTest {
protected:
    ModemSourceTest()
    {
        // As the service does while a client streams.
        source.available = [this] { take(); };
    }
    void take()
    {
        while (auto message = source.next())
            trees.push_back(lists.parse(message->bytes));
    }
    DictionaryRef last() const { return trees.back().dictionary(); }

    PropertyListCodec lists;
    ModemSource source{client, {}, queue, clock, lists};
    std::vector<Value> trees;
};

TEST_F(ModemSourceTest, IsOfTheTechnologyIfxBeforeAnyModemIsThere)
{
    EXPECT_EQ(source.technology(), kVoxLogChannelTechnology_IFX);
    EXPECT_TRUE(source.isLive());
    EXPECT_FALSE(source.next()) << "no client streams";
    source.streamedTo(1);
    take();
    ASSERT_EQ(trees.size(), 1U);
    EXPECT_THAT(textOf(lists.toXml(trees.back())->bytes()), testing::HasSubstr("Status</key>"));
    EXPECT_EQ(last()->at("Time"), "2026-11-16T06:05:42.000Z");
}

TEST_F(ModemSourceTest, GivesATreeAtLeastEveryTwoSecondsAndAtOnceToEachNewClient)
{
    ASSERT_TRUE(eventually(
        [&] { return !client.states().daemonVersion.empty() && client.states().daemon == ModemDaemon::Present; }));
    source.streamedTo(1);
    take();
    ASSERT_EQ(trees.size(), 1U);
    trees.clear();
    wait(10s);
    EXPECT_EQ(trees.size(), 5U);
    EXPECT_EQ(last()->at("Time"), "2026-11-16T06:05:52.000Z");
    source.streamedTo(2);
    take();
    EXPECT_EQ(trees.size(), 6U);
    source.streamedTo(1);
    take();
    EXPECT_EQ(trees.size(), 6U) << "a client that leaves needs none";
}

TEST_F(ModemSourceTest, GivesOneTreeForChangesThatComeTogether)
{
    const auto path = daemon->plugIn(Fake::modem("abcd"));
    source.streamedTo(1);
    ASSERT_TRUE(measures(path));
    queue.advance(1900ms);
    settle();
    queue.advance(200ms);
    trees.clear();
    for (int level = 80; level < 100; ++level)
        daemon->set(path, Fake::kSignal, {{"Lte", QVariantMap{{"rsrp", -double(level)}}}});
    ASSERT_TRUE(eventually([&] { return modem().signal.lte && modem().signal.lte->rsrp == -99; }));
    EXPECT_TRUE(trees.empty());
    queue.advance(100ms);
    ASSERT_EQ(trees.size(), 1U);
}

TEST_F(ModemSourceTest, MakesNoTreeAndMeasuresNothingWhileNoClientStreams)
{
    const auto path = daemon->plugIn(Fake::modem("abcd"));
    source.streamedTo(1);
    ASSERT_TRUE(measures(path));
    source.streamedTo(0);
    ASSERT_TRUE(eventually([&] { return client.isAtRest(); }));
    EXPECT_EQ(daemon->rate(path), 0U);
    trees.clear();
    daemon->set(path, Fake::kModem, {{"Model", "Other"}});
    ASSERT_TRUE(eventually([&] { return modem().model == "Other"; }));
    queue.advance(10s);
    EXPECT_TRUE(trees.empty());
    EXPECT_EQ(queue.timers(), 0U);
    source.streamedTo(1);
    take();
    EXPECT_EQ(trees.size(), 1U);
}

} // namespace
} // namespace kestrum
