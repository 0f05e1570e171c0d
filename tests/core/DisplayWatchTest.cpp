// What a watch learns of the displays.
#include "core/DisplayWatch.h"

#include "LogGenerator/State.h"
#include "core/Monitor.h"
#include "support/Format.h"

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class WatchTest : public Monitor, public DisplayWatch {
protected:
    WatchTest()
    {
        startRunning();
        model->setWatch(this);
    }

    void displayMade(const Dictionary& entry) override { seen.push_back(deepCopy(entry.at(StateKey::kDisplay))); }

    void messageDecoded(const LogGenerator& generator, const State& state, Bytes message) override
    {
        calls.push_back(formatted("%@ %@ %lu bytes", generator.technology(), describe(state.at(StateKey::kDisplay)),
                                  static_cast<unsigned long>(message.size())));
    }
    void connectionChanged(bool isConnected) override { calls.emplace_back(isConnected ? "connected" : "lost"); }
    void timePassed(std::chrono::milliseconds time) override { passed += time; }

    static Value display(const char* rat) { return makeDictionary({{"RAT", rat}, {"Cell", "17"}}); }

    std::vector<Value> seen;
    std::vector<std::string> calls;
    std::chrono::milliseconds passed{0};
};

TEST_F(WatchTest, LearnsEachDisplayOnceWhenAScreenAsksForIt)
{
    stream(display("GSM"));
    seconds(2);
    EXPECT_THAT(seen, IsEmpty());
    model->topLevelNodes();
    model->nodeAtPath("/RAT");
    EXPECT_THAT(seen, ElementsAre(display("GSM")));

    seconds(20); // without data there is no new display
    model->topLevelNodes();
    EXPECT_EQ(seen.size(), 1u);

    stream(display("UMTS"));
    seconds(2);
    model->topLevelNodes();
    EXPECT_THAT(seen, ElementsAre(display("GSM"), display("UMTS")));
}

TEST_F(WatchTest, IsNotToldAfterItWasRemoved)
{
    model->setWatch(nullptr);
    stream(display("GSM"));
    seconds(2);
    EXPECT_TRUE(model->topLevelNodes());
    EXPECT_THAT(seen, IsEmpty());
}

TEST_F(WatchTest, LearnsEachMessageWhenTheStateHasIt)
{
    stream(display("GSM"));
    stream(display("UMTS"));
    EXPECT_THAT(calls, ElementsAre(formatted("kVoxLogChannelTechnology_IFX %@ 4 bytes", describe(display("GSM"))),
                                   formatted("kVoxLogChannelTechnology_IFX %@ 4 bytes", describe(display("UMTS")))));
    model->setWatch(nullptr);
    stream(display("LTE"));
    EXPECT_EQ(calls.size(), 2u);
}

TEST_F(WatchTest, LearnsThatTheConnectionIsLostAndBack)
{
    ports.kill(kCommandPort);
    seconds(2);
    EXPECT_THAT(calls, ElementsAre("lost"));
    seconds(20); // further attempts fail
    EXPECT_THAT(calls, ElementsAre("lost"));
    serve();
    seconds(5);
    EXPECT_THAT(calls, ElementsAre("lost", "connected"));
}

TEST_F(WatchTest, LearnsOfTheTimeThatPassesWithAConnection)
{
    seconds(10);
    EXPECT_EQ(passed, std::chrono::seconds(10));
    ports.kill(kCommandPort);
    seconds(60);
    EXPECT_EQ(passed, std::chrono::seconds(12));
}

TEST_F(WatchTest, ContentsOfASnapshotAreThoseOfTheHistoryThatIsGiven)
{
    stream(display("GSM"));
    seconds(2);
    model->topLevelNodes();
    const auto entry = makeDictionary({{"Description", "an earlier moment"}});
    const auto contents = model->getSaveContents(makeArray({entry}));
    EXPECT_EQ(Value(contents), Value(makeArray({entry})));
    EXPECT_EQ(model->getSaveContents()->size(), 1u);
}

} // namespace
} // namespace kestrum
