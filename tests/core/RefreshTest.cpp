// From a message to the tree: which parts are rebuilt, and when.
#include "core/Monitor.h"

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class Refresh : public Monitor {
protected:
    Refresh() { startRunning(); }

    Value display(const char* rat) { return makeDictionary({{"RAT", rat}, {"Cell", "17"}}); }
};

TEST_F(Refresh, RunsEveryTwoSeconds)
{
    stream(display("GSM"));
    seconds(1.999);
    EXPECT_THAT(told, IsEmpty());
    seconds(0.001);
    EXPECT_THAT(told, ElementsAre("update"));

    stream(display("UMTS"));
    seconds(2);
    EXPECT_THAT(told, ElementsAre("update", "update"));
}

TEST_F(Refresh, ShowsWhatTheLastMessageHeld)
{
    stream(display("GSM"));
    stream(display("UMTS"));
    seconds(2);
    EXPECT_EQ(textAt("/RAT"), "UMTS");
}

TEST_F(Refresh, WithoutAMessageLeavesTreeAndScreensUntouched)
{
    stream(display("GSM"));
    seconds(2);
    const auto tree = model->topLevelNodes();
    told.clear();

    seconds(20);
    EXPECT_THAT(told, IsEmpty());
    EXPECT_EQ(model->topLevelNodes(), tree);
}

TEST_F(Refresh, MessagesAloneNeverRebuildTheTree)
{
    stream(display("GSM"));
    seconds(2);
    const auto tree = model->topLevelNodes();
    for (int i = 0; i < 100; ++i)
        stream(display("UMTS"));
    EXPECT_EQ(model->topLevelNodes(), tree);
    EXPECT_EQ(textAt("/RAT"), "GSM");
}

TEST_F(Refresh, TreeIsBuiltOnceAndOnlyWhenAskedFor)
{
    stream(display("GSM"));
    seconds(2);
    EXPECT_THAT(*model->getSaveContents(), IsEmpty()); // no save contents were requested before
    const auto tree = model->topLevelNodes();
    EXPECT_EQ(model->nodeAtPath("/"), tree);
    EXPECT_EQ(model->topLevelNodes(), tree);
    EXPECT_THAT(*model->getSaveContents(), testing::SizeIs(1));
}

TEST_F(Refresh, AskingForAPathBuildsTheTree)
{
    stream(display("GSM"));
    seconds(2);
    EXPECT_EQ(textAt("/Cell"), "17");
}

TEST_F(Refresh, UnknownPathHasNoNode)
{
    stream(display("GSM"));
    seconds(2);
    EXPECT_EQ(model->nodeAtPath("/Nothing"), nullptr);
    EXPECT_EQ(model->nodeAtPath(""), nullptr);
}

TEST_F(Refresh, OldNodesStayValid)
{
    stream(display("GSM"));
    seconds(2);
    const auto old = model->nodeAtPath("/RAT");
    stream(display("UMTS"));
    seconds(2);
    EXPECT_EQ(*old->value(), "GSM");
    EXPECT_EQ(textAt("/RAT"), "UMTS");
}

TEST_F(Refresh, HistoryKeepsTheNewestFiveDisplays)
{
    for (int i = 0; i < 7; ++i) {
        stream(display(std::to_string(i).c_str()));
        seconds(2);
        model->topLevelNodes();
    }
    const auto contents = model->getSaveContents();
    ASSERT_EQ(contents->size(), 5u);
    EXPECT_EQ((*contents)[0].dictionary()->at("Display").dictionary()->at("RAT"), Value("2"));
    EXPECT_EQ((*contents)[4].dictionary()->at("Display").dictionary()->at("RAT"), Value("6"));
    EXPECT_EQ((*contents)[4].dictionary()->at("Date"), Value("2026-11-16 06:05:56 +0000"));
}

TEST_F(Refresh, MessageWithAnotherIdIsIgnored)
{
    for (const std::int32_t id : {1, -1, INT32_MAX, INT32_MIN})
        stream(display("GSM"), id);
    seconds(4);
    EXPECT_THAT(told, IsEmpty());
    EXPECT_THAT(log.lines, IsEmpty());
}

// A bad message has no effect on other messages.

TEST_F(Refresh, MessageThatIsNoPropertyListIsLoggedAndTheNextIsServed)
{
    stream(display("GSM"));
    stream(Value());
    EXPECT_THAT(log.errors(), ElementsAre(testing::AllOf(testing::HasSubstr("Could not deserialize the object"),
                                                         testing::HasSubstr("LogGenerator/GSM/GSMLogGenerator:90"))));
    seconds(2);
    EXPECT_EQ(textAt("/RAT"), "GSM");
    stream(display("UMTS"));
    seconds(2);
    EXPECT_EQ(textAt("/RAT"), "UMTS");
}

TEST_F(Refresh, BadMessageCountsAsAnUpdateAllTheSame)
{
    stream(Value());
    seconds(2);
    EXPECT_THAT(told, ElementsAre("update"));
}

TEST_F(Refresh, NumberInAMessageIsLogged)
{
    stream(makeDictionary({{"RSSI", -71}, {"RAT", "GSM"}}));
    EXPECT_THAT(log.errors(), ElementsAre(testing::HasSubstr("Unknown object of type integer encountered")));
}

// Without a generator.

class WithoutGenerator : public Monitor {};

TEST_F(WithoutGenerator, ThereIsNoTree)
{
    EXPECT_EQ(model->topLevelNodes(), nullptr);
    for (const char* path : {"/", "", "/RAT"})
        EXPECT_EQ(model->nodeAtPath(path), nullptr);
}

TEST_F(WithoutGenerator, ThereIsNothingToSave)
{
    EXPECT_EQ(model->getSaveContents(), nullptr);
}

TEST_F(WithoutGenerator, DataIsDroppedAndCountsAsAnUpdate)
{
    model->updateWithData(bytesOf("anything"));
    EXPECT_THAT(log.lines, IsEmpty());
    model->refresh();
    queue.run();
    EXPECT_THAT(told, ElementsAre("update"));
    EXPECT_EQ(model->topLevelNodes(), nullptr);
}

// The running model is also owned by its timer.

TEST_F(Refresh, RunningModelOutlivesItsOwner)
{
    const std::weak_ptr<KestrumModel> watched = model;
    model->setObserver(nullptr);
    model.reset();
    EXPECT_FALSE(watched.expired());
    seconds(10);
    EXPECT_TRUE(ports.hasLocal(kLogPort));
    queue.drop();
    EXPECT_TRUE(watched.expired());
    EXPECT_FALSE(ports.hasLocal(kLogPort));
}

TEST_F(Refresh, ClosingTheChannelLetsTheModelGo)
{
    const std::weak_ptr<KestrumModel> watched = model;
    model.reset();
    watched.lock()->destroyPorts();
    EXPECT_TRUE(watched.expired());
    EXPECT_EQ(queue.timers(), 0u);
}

} // namespace
} // namespace kestrum
