#include "LogGenerator/LogGenerator.h"

#include "doubles/DecodingDoubles.h"

#include <gmock/gmock.h>

namespace kestrum {
namespace {

using testing::ElementsAre;

/// A generator that decodes nothing: it has only what all generators share.
class Plain final : public LogGenerator {
public:
    explicit Plain(DecodingRoles& roles) : LogGenerator(roles) {}
    std::string_view technology() const override { return "plain"; }
    void updateState(State&, Bytes) override {}
    Value generateLogUsingState(State& state) override
    {
        updateHistoryInState(state);
        return state.at("Display");
    }
    DictionaryRef getStartCommand() const override { return makeDictionary(); }
    ArrayRef getSaveContentsFromState(const State&) const override { return makeArray(); }
};

class History : public testing::Test {
protected:
    const Dictionary& entry(std::size_t at) const { return *(*state.at("History").array())[at].dictionary(); }
    std::vector<std::string> keysOf(const Dictionary& dictionary) const
    {
        std::vector<std::string> keys;
        for (const auto& each : dictionary)
            keys.push_back(each.key);
        return keys;
    }

    DecodingDoubles doubles;
    Plain generator{doubles.roles};
    State state;
};

TEST_F(History, CreationIsLoggedWithTheGeneratorsAddress)
{
    doubles.log.showsAddresses = true;
    const Plain other(doubles.roles);
    EXPECT_EQ(doubles.log.lines.back().second, formatted("Creating Log object: %p", static_cast<const void*>(&other)));
}

TEST_F(History, CreationOfAGeneratorIsLogged)
{
    EXPECT_THAT(doubles.log.lines, ElementsAre(RecordingLog::Line(Priority::Warning, "Creating Log object: 0x0")));
}

TEST_F(History, StateWithoutOneGetsOneOnTheFirstCall)
{
    EXPECT_FALSE(state.contains("History"));
    generator.generateLogUsingState(state);
    EXPECT_EQ(state.at("History").array()->size(), 1u);
}

TEST_F(History, EntryHasExactlyItsFiveKeys)
{
    state.set("DisplayState", Data(bytesOf("raw")));
    state.set("Display", makeDictionary({{"RAT", "GSM"}}));
    state.set("ExtraInfo", makeDictionary());
    generator.generateLogUsingState(state);
    EXPECT_THAT(keysOf(entry(0)), ElementsAre("DisplayState", "Display", "ExtraInfo", "Date", "Description"));
    EXPECT_EQ(entry(0).at("DisplayState"), Value(Data(bytesOf("raw"))));
    EXPECT_EQ(entry(0).at("Date"), Value("2026-11-16 06:05:42 +0000"));
    EXPECT_EQ(entry(0).at("Description"), Value("Snapshot (2026-11-16 06:05:42 +0000)"));
}

TEST_F(History, EntryWithoutDisplayStateHoldsNoKeys)
{
    state.set("Display", makeDictionary());
    state.set("ExtraInfo", makeDictionary());
    generator.generateLogUsingState(state);
    EXPECT_TRUE(entry(0).empty());
}

TEST_F(History, EntryWithoutDisplayHoldsTheDisplayStateAlone)
{
    state.set("DisplayState", "raw");
    state.set("ExtraInfo", makeDictionary());
    generator.generateLogUsingState(state);
    EXPECT_THAT(keysOf(entry(0)), ElementsAre("DisplayState"));
}

TEST_F(History, EntryWithoutExtraInfoEndsBeforeIt)
{
    state.set("DisplayState", "raw");
    state.set("Display", makeDictionary());
    generator.generateLogUsingState(state);
    EXPECT_THAT(keysOf(entry(0)), ElementsAre("DisplayState", "Display"));
}

TEST_F(History, DisplayIsCopiedAtItsTopLevelOnly)
{
    auto cell = makeDictionary({{"RSSI", "-80 dBm"}});
    auto display = makeDictionary({{"RAT", "GSM"}, {"Cell", cell}});
    state.set("DisplayState", "raw");
    state.set("Display", display);
    generator.generateLogUsingState(state);
    display->set("RAT", "UMTS");
    cell->set("RSSI", "-71 dBm");
    const auto kept = entry(0).at("Display").dictionary();
    EXPECT_EQ(kept->at("RAT"), Value("GSM"));
    EXPECT_EQ(kept->at("Cell").dictionary(), cell);
}

TEST_F(History, DisplayStateAndExtraInfoAreCopiedAtTheirTopLevel)
{
    auto displayState = makeArray({"raw"});
    auto extraInfo = makeDictionary({{"Sequence", 1}});
    state.set("DisplayState", displayState);
    state.set("Display", makeDictionary());
    state.set("ExtraInfo", extraInfo);
    generator.generateLogUsingState(state);
    displayState->append("more");
    extraInfo->set("Sequence", 2);
    EXPECT_EQ(entry(0).at("DisplayState"), Value(makeArray({"raw"})));
    EXPECT_EQ(entry(0).at("ExtraInfo"), Value(makeDictionary({{"Sequence", 1}})));
}

TEST_F(History, ArrayDisplayIsCopiedToo)
{
    auto display = makeArray({"a"});
    state.set("DisplayState", "raw");
    state.set("Display", display);
    generator.generateLogUsingState(state);
    display->clear();
    EXPECT_EQ(entry(0).at("Display"), Value(makeArray({"a"})));
}

TEST_F(History, SixthCallLeavesFiveAndTheSecondComesFirst)
{
    for (int i = 1; i <= 6; ++i) {
        state.set("DisplayState", std::to_string(i));
        generator.generateLogUsingState(state);
    }
    ASSERT_EQ(state.at("History").array()->size(), 5u);
    EXPECT_EQ(entry(0).at("DisplayState"), Value("2"));
    EXPECT_EQ(entry(4).at("DisplayState"), Value("6"));
}

TEST_F(History, FifthCallKeepsAllFive)
{
    for (int i = 1; i <= 5; ++i) {
        state.set("DisplayState", std::to_string(i));
        generator.generateLogUsingState(state);
    }
    ASSERT_EQ(state.at("History").array()->size(), 5u);
    EXPECT_EQ(entry(0).at("DisplayState"), Value("1"));
}

TEST_F(History, LongerOneIsCutToFive)
{
    state.set("History", makeArray({"1", "2", "3", "4", "5", "6", "7", "8"}));
    generator.generateLogUsingState(state);
    const auto history = state.at("History").array();
    ASSERT_EQ(history->size(), 5u);
    EXPECT_EQ((*history)[0], Value("5"));
}

} // namespace
} // namespace kestrum
