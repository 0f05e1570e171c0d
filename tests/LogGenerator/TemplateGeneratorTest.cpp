#include "LogGenerator/Messages.h"
#include "LogGenerator/Sections.h"

#include <gmock/gmock.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::ElementsAreArray;
using testing::IsEmpty;

using Line = RecordingLog::Line;

class TemplateGenerator : public testing::Test {
protected:
    DictionaryRef display() const { return doubles.state.at("Display").dictionary(); }
    Value cell() const { return display()->at("Radio").dictionary()->at("Cell"); }
    Value neighbors() const { return (*display()->at("Lists").array())[0].dictionary()->at("Neighbors"); }
    std::vector<std::byte> rawOfLastInterval() const
    {
        const auto bytes = doubles.state.at("DisplayState").data()->bytes();
        return {bytes.begin(), bytes.end()};
    }

    SampleDoubles doubles;
    std::unique_ptr<sample::Generator> generator = std::make_unique<sample::Generator>(doubles.roles);
};

// Creation and end.

TEST_F(TemplateGenerator, CreationIsLogged)
{
    EXPECT_THAT(doubles.log.lines,
                ElementsAre(Line(Priority::Warning, "Array Count: 3"), Line(Priority::Warning, "Array Count: 2"),
                            Line(Priority::Warning, "Array Count: 0"),
                            Line(Priority::Error, "Creating ZPHLogGenerator2 object with 0x0"),
                            Line(Priority::Warning, "Creating Log object: 0x0"),
                            Line(Priority::Error, "Class Index: 1")));
}

TEST_F(TemplateGenerator, DestructionIsLoggedUnderOneNameForAll)
{
    doubles.log.lines.clear();
    generator.reset();
    EXPECT_THAT(doubles.log.lines, ElementsAre(Line(Priority::Warning, "ZPH_GSMLogGenerator is destructed 0x0")));
    EXPECT_THAT(doubles.console.printed, ElementsAre("Deallocing ClassIndex"));
}

TEST_F(TemplateGenerator, LinesNameTheIndexAndTheGeneratorInTheirPlaces)
{
    doubles.log.showsAddresses = true;
    auto index = std::make_unique<sample::Index>(doubles.roles);
    const auto shown = [](const void* address) { return formatted("%p", address); };
    const auto ofIndex = shown(index.get());
    auto other = std::make_unique<sample::Generator>(doubles.roles, std::move(index));
    const auto ofGenerator = shown(other.get());
    EXPECT_EQ(doubles.log.count("Creating ZPHLogGenerator2 object with " + ofIndex), 1u);
    other->getDisplayFromState(doubles.state);
    EXPECT_EQ(doubles.log.count("Initialized class index: " + ofIndex + ", Self: " + ofGenerator), 1u);
    other.reset();
    EXPECT_EQ(doubles.log.lines.back().second, "ZPH_GSMLogGenerator is destructed " + ofGenerator);
}

TEST_F(TemplateGenerator, KeepsABoundedIntervalOfRawRecordsAndLogsWhatItDrops)
{
    const std::vector<std::byte> invalid(4 << 20, std::byte{7});
    for (int i = 0; i < 17; ++i)
        generator->updateState(doubles.state, invalid);
    generator->generateLogUsingState(doubles.state);
    EXPECT_EQ(rawOfLastInterval().size(), 64u << 20);
    EXPECT_EQ(doubles.log.texts(Priority::Warning).back(),
              "Too many raw records for one interval: the oldest 1 were dropped");

    doubles.log.lines.clear();
    generator->updateState(doubles.state, message(1, 0x4001, {7}));
    generator->generateLogUsingState(doubles.state);
    EXPECT_EQ(rawOfLastInterval(), message(1, 0x4001, {7}));
    EXPECT_EQ(doubles.log.count("Too many raw records for one interval: the oldest 0 were dropped"), 0u);
}

TEST_F(TemplateGenerator, WithoutInitialisationEveryCallIsHarmless)
{
    const auto bare = sample::Generator::uninitialized(doubles.roles);
    bare->updateState(doubles.state, message(1, 0x4001, {7}));
    bare->updateState(doubles.state, {});
    EXPECT_TRUE(bare->generateLogUsingState(doubles.state).isNull());
    EXPECT_EQ(Value(bare->getStartCommand()),
              Value(makeDictionary(
                  {{"SetState", "Streaming"}, {"SetZephraLogCodes", makeArray()}, {"SetVoxExtraCodes", makeArray()}})));
    EXPECT_THAT(sample::calls(), IsEmpty());
}

// The display and its template.

TEST_F(TemplateGenerator, FirstRecordMakesTheDisplayBeforeItIsDecoded)
{
    generator->updateState(doubles.state, message(1, 0x4001, {7}));
    EXPECT_EQ(cell(), Value(makeDictionary({{"Channel", "7"}})));
    EXPECT_EQ(neighbors(), Value(makeArray({"7"})));
    EXPECT_EQ(display()->at("Legend"), Value("values in dBm"));
    EXPECT_EQ(doubles.state.at("ExtraInfo"), Value(makeDictionary()));
}

TEST_F(TemplateGenerator, NewDisplayHasANewExtraInfo)
{
    const auto old = makeDictionary({{"Sequence", 7}});
    doubles.state.set("ExtraInfo", old);
    generator->getDisplayFromState(doubles.state);
    EXPECT_EQ(doubles.state.at("ExtraInfo"), Value(makeDictionary()));
    EXPECT_EQ(Value(old), Value(makeDictionary({{"Sequence", 7}}))) << "history may hold it";
}

TEST_F(TemplateGenerator, CallThatMakesTheDisplayReturnsNothingAndLaterOnesReturnIt)
{
    EXPECT_TRUE(generator->getDisplayFromState(doubles.state).isNull());
    ASSERT_NE(display(), nullptr);
    EXPECT_EQ(generator->getDisplayFromState(doubles.state).dictionary(), display());
}

TEST_F(TemplateGenerator, RefreshBeforeAnyRecordShowsNothingOnce)
{
    EXPECT_TRUE(generator->generateLogUsingState(doubles.state).isNull());
    EXPECT_EQ(generator->generateLogUsingState(doubles.state).dictionary(), display());
}

TEST_F(TemplateGenerator, MakingTheDisplayIsLogged)
{
    doubles.log.lines.clear();
    generator->getDisplayFromState(doubles.state);
    EXPECT_THAT(doubles.log.lines,
                ElementsAre(Line(Priority::Warning, "Initialized class index: 0x0, Self: 0x0"),
                            Line(Priority::Warning, "Dictionary = 1"), Line(Priority::Warning, "String = 0"),
                            Line(Priority::Warning, "Cell"), Line(Priority::Warning, "Neighbors"),
                            Line(Priority::Warning, "Legend")));
}

TEST_F(TemplateGenerator, TemplateItselfIsNotDisplayed)
{
    generator->updateState(doubles.state, message(1, 0x4001, {7}));
    EXPECT_EQ(doubles.state.at("Template"), sample::templateTree());
}

TEST_F(TemplateGenerator, TemplateIsReadOncePerState)
{
    generator->getDisplayFromState(doubles.state);
    doubles.propertyLists.files.clear();
    doubles.state.remove("Display");
    generator->getDisplayFromState(doubles.state);
    EXPECT_NE(display(), nullptr);
}

TEST_F(TemplateGenerator, MissingTemplateIsLoggedAndTriedAgain)
{
    doubles.bundle.paths.clear();
    doubles.log.lines.clear();
    generator->updateState(doubles.state, message(1, 0x4001, {7}));
    EXPECT_TRUE(generator->generateLogUsingState(doubles.state).isNull());
    EXPECT_EQ(doubles.log.count("Cannot load template for display"), 2u);
    EXPECT_FALSE(doubles.state.contains("Display"));
    EXPECT_THAT(sample::calls(), ElementsAre("Cell 16385 14", "Neighbors 16385 14")); // no error

    doubles.bundle.paths = {"Sample.plist"};
    generator->updateState(doubles.state, message(1, 0x4001, {8}));
    EXPECT_EQ(cell(), Value(makeDictionary({{"Channel", "8"}})));
}

TEST_F(TemplateGenerator, TemplateThatIsNoDictionaryCannotBeLoaded)
{
    doubles.propertyLists.files["Sample.plist"] = makeArray({"x"});
    generator->getDisplayFromState(doubles.state);
    EXPECT_THAT(doubles.log.errors(), testing::Contains("Cannot load template for display").Times(1));
    EXPECT_FALSE(doubles.state.contains("Template"));
}

TEST_F(TemplateGenerator, OtherTypesInATemplateAreLoggedAndLeftOut)
{
    doubles.log.lines.clear();
    const Value processed = generator->processTemplate(
        makeDictionary({{"Number", 1}, {"Text", "x"}, {"List", makeArray({true, "y", Date()})}}));
    EXPECT_EQ(processed, Value(makeDictionary({{"Text", "x"}, {"List", makeArray({"y"})}})));
    EXPECT_EQ(doubles.log.count("Received an object of unknown type"), 3u);
    EXPECT_EQ(doubles.log.count("Processing the template"), 3u);
    EXPECT_EQ(doubles.log.lines[0], Line(Priority::Error, "Received an object of unknown type"));
    EXPECT_EQ(doubles.log.lines[1], Line(Priority::Error, "Processing the template"));
}

TEST_F(TemplateGenerator, ProcessedTemplateSharesNoContainer)
{
    const auto original = makeDictionary({{"List", makeArray({"x"})}});
    const auto processed = generator->processTemplate(original).dictionary();
    EXPECT_NE(processed, original);
    EXPECT_NE(processed->at("List").array(), original->at("List").array());
}

TEST_F(TemplateGenerator, PrintingATreeLogsWhatItDoesNotKnow)
{
    doubles.log.lines.clear();
    generator->printDict(makeDictionary({{"a", makeArray({"x", 1, makeDictionary({{"b", true}})})}, {"c", "y"}}));
    EXPECT_THAT(doubles.log.lines, ElementsAre(Line(Priority::Error, "Received an object of unknown type"),
                                               Line(Priority::Error, "Received an object of unknown type")));
}

// Routing.

TEST_F(TemplateGenerator, SectionsOfACodeAreCalledInTheOrderOfTheirRegistration)
{
    generator->updateState(doubles.state, message(1, 0x4001, {7, 8}));
    EXPECT_THAT(sample::calls(), ElementsAre("Cell 16385 15", "Neighbors 16385 15"));
}

TEST_F(TemplateGenerator, CodeWithoutSubscribersCallsNoSection)
{
    generator->updateState(doubles.state, message(1, 0x4004));
    generator->updateState(doubles.state, message(1, 2));
    EXPECT_THAT(sample::calls(), IsEmpty());
}

TEST_F(TemplateGenerator, PrefixedMessageIsDecodedFromItsThirdByte)
{
    auto bytes = message(1, 0x4001, {7});
    bytes.insert(bytes.begin(), {std::byte{0x81}, std::byte{0xEE}});
    generator->updateState(doubles.state, bytes);
    EXPECT_THAT(sample::calls(), ElementsAre("Cell 16385 14", "Neighbors 16385 14"));
    EXPECT_EQ(cell(), Value(makeDictionary({{"Channel", "7"}})));
}

TEST_F(TemplateGenerator, ExtraCodeRecordReachesItsSections)
{
    generator->updateState(doubles.state, message(0xFF, 2, {9}));
    EXPECT_THAT(sample::calls(), ElementsAre("Cell 16711682 14"));
    EXPECT_EQ(cell(), Value(makeDictionary({{"Channel", "9"}})));
}

TEST_F(TemplateGenerator, TwelveBytesReachNoSection)
{
    auto bytes = message(1, 0x4001);
    bytes.pop_back();
    doubles.log.lines.clear();
    generator->updateState(doubles.state, bytes);
    EXPECT_THAT(sample::calls(), IsEmpty());
    EXPECT_THAT(doubles.log.errors(), IsEmpty());
}

TEST_F(TemplateGenerator, ElevenBytesBehindAPrefixAreRouted)
{
    generator->updateState(doubles.state, bytesFrom({0x81, 0, 1, 0, 0, 0x01, 0x40, 0, 0, 0, 0, 0, 0}));
    EXPECT_THAT(sample::calls(), ElementsAre("Cell 16385 11", "Neighbors 16385 11"));
}

TEST_F(TemplateGenerator, InvalidTypeIsLoggedAndDropped)
{
    doubles.log.lines.clear();
    generator->updateState(doubles.state, message(0x2A, 0x4001));
    EXPECT_THAT(sample::calls(), IsEmpty());
    EXPECT_THAT(doubles.log.errors(), ElementsAre("Invalid log type: 2a. Dropping."));
}

// The raw messages.

TEST_F(TemplateGenerator, EveryMessageIsKeptAsItCame)
{
    std::vector<std::byte> expected;
    auto prefixed = message(1, 0x4001, {7});
    prefixed.insert(prefixed.begin(), {std::byte{0x81}, std::byte{0xEE}});
    for (const auto& each : {prefixed, message(0x2A, 1), message(1, 0x4004), bytesFrom({1, 2, 3})}) {
        generator->updateState(doubles.state, each);
        expected.insert(expected.end(), each.begin(), each.end());
    }
    generator->generateLogUsingState(doubles.state);
    EXPECT_EQ(rawOfLastInterval(), expected);
}

TEST_F(TemplateGenerator, RawMessageOutlivesADecodersFailure)
{
    const auto broken = message(1, 0x4003);
    EXPECT_THROW(generator->updateState(doubles.state, broken), std::runtime_error);
    generator->generateLogUsingState(doubles.state);
    EXPECT_EQ(rawOfLastInterval(), broken);
}

TEST_F(TemplateGenerator, EachIntervalBeginsEmpty)
{
    generator->updateState(doubles.state, message(1, 0x4001, {7}));
    generator->generateLogUsingState(doubles.state);
    generator->generateLogUsingState(doubles.state);
    EXPECT_THAT(rawOfLastInterval(), IsEmpty());
    generator->updateState(doubles.state, message(1, 0x4002));
    generator->generateLogUsingState(doubles.state);
    EXPECT_EQ(rawOfLastInterval(), message(1, 0x4002));
}

TEST_F(TemplateGenerator, HistoryKeepsEachIntervalsMessages)
{
    for (std::uint8_t i = 0; i < 7; ++i) {
        generator->updateState(doubles.state, message(1, 0x4002, {i}));
        generator->generateLogUsingState(doubles.state);
    }
    const auto history = doubles.state.at("History").array();
    ASSERT_EQ(history->size(), 5u);
    const auto bytes = (*history)[0].dictionary()->at("DisplayState").data()->bytes();
    EXPECT_THAT(std::vector(bytes.begin(), bytes.end()), ElementsAreArray(message(1, 0x4002, {2})));
}

// The start command.

TEST_F(TemplateGenerator, StartCommandListsTheCodesOfItsSections)
{
    EXPECT_EQ(Value(generator->getStartCommand()),
              Value(makeDictionary({{"SetState", "Streaming"},
                                    {"SetZephraLogCodes", makeArray({16385, 16386, 16387})},
                                    {"SetVoxExtraCodes", makeArray({2})}})));
}

TEST_F(TemplateGenerator, WithoutCodesItsListsAreEmpty)
{
    const sample::Generator bare(doubles.roles, std::make_unique<sample::NoSections>(doubles.roles));
    EXPECT_EQ(Value(bare.getStartCommand()),
              Value(makeDictionary(
                  {{"SetState", "Streaming"}, {"SetZephraLogCodes", makeArray()}, {"SetVoxExtraCodes", makeArray()}})));
}

} // namespace
} // namespace kestrum
