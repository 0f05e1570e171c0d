// The modem's technology changes, or is the same again, after a restart of the service.
#include "core/Monitor.h"

namespace kestrum {
namespace {

using testing::Contains;
using testing::ElementsAre;
using testing::Not;

class Technology : public Monitor {
protected:
    Technology()
    {
        bundle.paths = {"LTE.plist"};
        propertyLists.files["LTE.plist"] = makeDictionary({{"About", "LTE cells"}});
    }

    void restartWith(std::string_view name)
    {
        modemRuns(name);
        model->restartMonitor();
        queue.run();
    }
};

TEST_F(Technology, SameAgainKeepsTheDisplayOnScreen)
{
    startRunning();
    stream(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    seconds(2);
    const auto tree = model->topLevelNodes();
    told.clear();

    restartWith("kVoxLogChannelTechnology_IFX");
    EXPECT_THAT(told, ElementsAre("status"));
    EXPECT_EQ(model->topLevelNodes(), tree);
}

TEST_F(Technology, AnotherThanTheDisplaysReplacesIt)
{
    startRunning();
    stream(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    seconds(2);
    ASSERT_EQ(textAt("/RAT"), "GSM");
    told.clear();

    restartWith("kVoxLogChannelTechnology_Zephra_LTE");
    EXPECT_THAT(told, ElementsAre("replaced", "status"));
    EXPECT_EQ(textAt("/RAT"), "(no node)");

    // The call that makes the new display shows nothing yet; the one after the first record does.
    EXPECT_EQ(textAt("/"), "(unknown)");
    model->updateWithData(bytesOf("a message"));
    seconds(2);
    EXPECT_EQ(textAt("/About"), "LTE cells");
}

TEST_F(Technology, ReplacedDisplayLeavesItsHistory)
{
    startRunning();
    stream(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    seconds(2);
    model->topLevelNodes();

    restartWith("kVoxLogChannelTechnology_Zephra_LTE");
    const auto history = model->getSaveContents();
    EXPECT_EQ((*history)[0].dictionary()->at("Display").dictionary()->at("RAT"), Value("GSM"));
}

TEST_F(Technology, BackToObjectsReplacesTheTemplatesDisplay)
{
    modemRuns("kVoxLogChannelTechnology_Zephra_LTE");
    startRunning();
    model->updateWithData(bytesOf("a message"));
    seconds(2);
    ASSERT_EQ(textAt("/About"), "LTE cells");
    told.clear();

    restartWith("kVoxLogChannelTechnology_IFX");
    EXPECT_THAT(told, ElementsAre("replaced", "status"));
    EXPECT_EQ(textAt("/About"), "(no node)");
    stream(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    seconds(2);
    EXPECT_EQ(textAt("/RAT"), "GSM");
}

TEST_F(Technology, ChangeBeforeAnythingWasShownReplacesNothing)
{
    startRunning();
    restartWith("kVoxLogChannelTechnology_Zephra_LTE");
    EXPECT_THAT(told, Not(Contains("replaced")));
}

} // namespace
} // namespace kestrum
