// What a watch learns of the displays.
#include "core/DisplayWatch.h"

#include "LogGenerator/State.h"
#include "core/Monitor.h"

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

    static Value display(const char* rat) { return makeDictionary({{"RAT", rat}, {"Cell", "17"}}); }

    std::vector<Value> seen;
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
