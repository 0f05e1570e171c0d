// A new generator continues with the state of an earlier one.
#include "LogGenerator/Messages.h"
#include "LogGenerator/Sections.h"

#include <gmock/gmock.h>

namespace kestrum {
namespace {

class TakeOver : public testing::Test {
protected:
    TakeOver()
    {
        sample::Generator first(doubles.roles);
        first.updateState(doubles.state, message(1, 0x4001, {7}));
        first.generateLogUsingState(doubles.state);
        built = doubles.state.at("Display").dictionary();
    }

    static Value cellOf(const Value& display)
    {
        return display.dictionary()->at("Radio").dictionary()->at("Cell").dictionary()->at("Channel");
    }
    static Value neighborsOf(const Value& display)
    {
        return (*display.dictionary()->at("Lists").array())[0].dictionary()->at("Neighbors");
    }

    SampleDoubles doubles;
    DictionaryRef built;
};

TEST_F(TakeOver, NextRecordIsShownInTheExistingDisplay)
{
    sample::Generator next(doubles.roles);
    next.updateState(doubles.state, message(1, 0x4001, {8, 9}));
    EXPECT_EQ(doubles.state.at("Display").dictionary(), built);
    EXPECT_EQ(cellOf(built), Value("8"));
    EXPECT_EQ(neighborsOf(built), Value(makeArray({"8", "9"})));
}

TEST_F(TakeOver, DisplayIsThereAtOnceWithItsOldValues)
{
    sample::Generator next(doubles.roles);
    const Value shown = next.generateLogUsingState(doubles.state);
    EXPECT_EQ(shown.dictionary(), built);
    EXPECT_EQ(cellOf(shown), Value("7"));
}

TEST_F(TakeOver, HistoryContinues)
{
    sample::Generator next(doubles.roles);
    next.generateLogUsingState(doubles.state);
    EXPECT_EQ(doubles.state.at("History").array()->size(), 2u);
}

TEST_F(TakeOver, WorksGenerationAfterGeneration)
{
    for (std::uint8_t i = 10; i < 20; ++i) {
        sample::Generator next(doubles.roles);
        next.updateState(doubles.state, message(1, 0x4001, {i}));
        EXPECT_EQ(cellOf(built), Value(std::to_string(i)));
    }
}

TEST_F(TakeOver, RowOfAListIsNoSectionThoughItBearsASectionsName)
{
    // A record can put any name into the display. Only the template decides where sections are.
    built->set("Cell", makeDictionary({{"Channel", "not a section"}}));
    sample::Generator next(doubles.roles);
    next.updateState(doubles.state, message(1, 0x4001, {8}));
    EXPECT_EQ(cellOf(built), Value("8"));
    EXPECT_EQ(built->at("Cell").dictionary()->at("Channel"), Value("not a section"));
}

TEST_F(TakeOver, DisplayThatLostNodesIsTakenAsFarAsItGoes)
{
    built->remove("Radio");
    built->at("Lists").array()->clear();
    sample::Generator next(doubles.roles);
    next.updateState(doubles.state, message(1, 0x4001, {8}));
    EXPECT_EQ(built->at("Legend"), Value("values in dBm"));
    EXPECT_FALSE(built->contains("Radio"));
}

TEST_F(TakeOver, DisplayOfAnotherTechnologyIsPutAside)
{
    const Value history = shallowCopy(doubles.state.at("History"));
    doubles.state.set("Lookup", makeDictionary({{"key", "value"}}));
    sample::Generator other(doubles.roles, "another");
    EXPECT_TRUE(other.replacesDisplayOf(doubles.state));

    other.updateState(doubles.state, message(1, 0x4001, {8}));
    const Value display = doubles.state.at("Display");
    EXPECT_NE(display.dictionary(), built);
    EXPECT_EQ(cellOf(display), Value("8"));
    EXPECT_EQ(cellOf(built), Value("7"));
    EXPECT_FALSE(doubles.state.contains("Lookup"));
    EXPECT_EQ(doubles.state.at("History"), history);
    EXPECT_FALSE(other.replacesDisplayOf(doubles.state));
}

TEST_F(TakeOver, PutAsideDisplayIsReleased)
{
    const std::weak_ptr<Dictionary> watched = std::exchange(built, nullptr);
    doubles.state.remove("History");
    doubles.propertyLists.files.clear();
    sample::Generator other(doubles.roles, "another");
    other.getDisplayFromState(doubles.state);
    EXPECT_TRUE(watched.expired());
}

TEST_F(TakeOver, PutAsideDisplayTakesItsRawRecordsAlong)
{
    ASSERT_TRUE(doubles.state.contains("DisplayState"));
    sample::Generator other(doubles.roles, "another");
    other.getDisplayFromState(doubles.state);
    EXPECT_FALSE(doubles.state.contains("DisplayState"));
}

TEST_F(TakeOver, ReplacedDisplayShowsNothingOnceAsEveryNewOneDoes)
{
    sample::Generator other(doubles.roles, "another");
    EXPECT_TRUE(other.generateLogUsingState(doubles.state).isNull());
    EXPECT_FALSE(other.generateLogUsingState(doubles.state).isNull());
}

TEST_F(TakeOver, DisplayOfUnknownOriginIsReturnedAsItIs)
{
    const Value foreign = deepCopy(built);
    doubles.state.set("Display", foreign);
    sample::Generator next(doubles.roles);
    EXPECT_FALSE(next.replacesDisplayOf(doubles.state));
    EXPECT_EQ(next.getDisplayFromState(doubles.state).dictionary(), foreign.dictionary());
    next.updateState(doubles.state, message(1, 0x4001, {8}));
    EXPECT_EQ(foreign, Value(built)) << "no section writes into it";
}

TEST_F(TakeOver, EmptyStateHasNothingToReplace)
{
    State empty;
    sample::Generator next(doubles.roles);
    EXPECT_FALSE(next.replacesDisplayOf(empty));
}

} // namespace
} // namespace kestrum
