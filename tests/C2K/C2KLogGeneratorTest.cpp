#include "C2K/C2KRun.h"
#include "harness/Places.h"

#include "platform/TelephonyService.h"
#include "platform/propertylist/PropertyListCodec.h"

#include <set>

namespace kestrum {
namespace {

RecordBuilder onChannel(unsigned channel)
{
    return record(0x1183, 50).u8(13, channel);
}

TEST(C2KTemplate, MarkerForSortingMakesNoLookupEntry)
{
    C2KRun run(makeDictionary({{"_sorted", "_sorted"}, {"0;Channel", "kChannel"}}));
    run.receive(onChannel(1));
    EXPECT_EQ(run.at("_sorted"), Value("_sorted"));
    EXPECT_FALSE(run.state.at("Lookup").dictionary()->contains("_sorted"));
    EXPECT_EQ(run.state.at("Lookup").dictionary()->size(), 1u);
}

TEST(C2KTemplate, AnIdentifierAtTwoPlacesShowsAtBoth)
{
    C2KRun run(makeDictionary({{"Here", "kChannel"}, {"Below", makeDictionary({{"There", "kChannel"}})}}));
    run.receive(onChannel(42));
    EXPECT_EQ(run.at("Here"), Value("42"));
    EXPECT_EQ(run.at("Below").dictionary()->at("There"), Value("42"));
}

TEST(C2KTemplate, AnIdentifierAtNoPlaceIsHarmless)
{
    C2KRun run(makeDictionary({{"Band", "kBandClass"}}));
    run.receive(onChannel(42));
    EXPECT_EQ(describe(run.display()), R"({"Band": "800 MHz cellular band [0]"})");
}

TEST(C2KTemplate, ShowsEmptyTextsBeforeTheFirstValue)
{
    C2KRun run(makeDictionary({{"Channel", "kChannel"}, {"Level", makeDictionary({{"Rate", "kFLDataRate"}})}}));
    run.receive(record(0x1184, 13));
    EXPECT_EQ(describe(run.display()), R"({"Channel": "", "Level": {"Rate": ""}})");
}

TEST(C2KTemplate, IgnoresValuesOfOtherKinds)
{
    C2KRun run(makeDictionary({{"Number", 5}, {"List", makeArray({"kChannel"})}, {"Channel", "kChannel"}}));
    run.receive(onChannel(7));
    EXPECT_EQ(describe(run.display()), R"({"Channel": "7"})");
}

TEST(C2KTemplate, IsAnnouncedOnceForEachLevel)
{
    C2KRun run(makeDictionary({{"A", makeDictionary({{"B", makeDictionary()}})}}));
    run.receive(record(0x1184, 13));
    EXPECT_EQ(run.doubles.log.count("Processing the template"), 3u);
}

TEST(C2KTemplate, ThatIsMissingIsReportedAndTriedAgain)
{
    C2KRun run;
    run.doubles.bundle.paths.clear();
    run.receive(onChannel(7));
    EXPECT_EQ(run.doubles.log.count("Cannot load C2K template for display"), 1u);
    EXPECT_TRUE(run.display().isNull());
    EXPECT_TRUE(run.generator->generateLogUsingState(run.state).isNull());

    run.doubles.bundle.paths = {"C2KTemplate.plist"};
    run.receive(onChannel(8));
    EXPECT_EQ(run.at("kChannel"), Value("8"));
}

TEST(C2KTemplate, OfTheApplicationNamesEveryIdentifierAndNoOther)
{
    PropertyListCodec codec;
    const Value shipped = codec.load(inCheckout("resources/C2KTemplate.plist"));
    ASSERT_TRUE(shipped.dictionary());
    std::set<std::string> named;
    const auto collect = [&](const auto& self, const Dictionary& level) -> void {
        for (const auto& [key, value] : level) {
            if (const auto below = value.dictionary())
                self(self, *below);
            else if (key != "_sorted")
                named.insert(*value.text());
        }
    };
    collect(collect, *shipped.dictionary());
    std::set<std::string> published;
    const auto all = C2KRun::everyIdentifier();
    for (const auto& entry : *all)
        published.insert(entry.key);
    EXPECT_EQ(named, published);
}

TEST(C2KLookup, StopsAtAnEntryThatIsNone)
{
    C2KRun run(makeDictionary({{"First", "kChannel"}, {"Second", "kChannel"}, {"Third", "kChannel"}}));
    run.receive(onChannel(1));
    auto entries = run.state.at("Lookup").dictionary()->at("kChannel").array();
    (*entries)[1].dictionary()->set("dict", "no dictionary");
    run.receive(onChannel(2));
    EXPECT_EQ(describe(run.display()), R"({"First": "2", "Second": "1", "Third": "1"})");

    (*entries)[0].dictionary()->set("key", 5);
    run.receive(onChannel(3));
    EXPECT_EQ(describe(run.display()), R"({"First": "2", "Second": "1", "Third": "1"})");
}

TEST(C2KLookup, WithoutAnArrayPublishesNothing)
{
    C2KRun run;
    run.receive(onChannel(1));
    run.state.at("Lookup").dictionary()->set("kChannel", "no array");
    run.receive(onChannel(2));
    EXPECT_EQ(run.at("kChannel"), Value("1"));
}

TEST(C2KRouting, AnInvalidTypeIsReportedAndShownAllTheSame)
{
    C2KRun run;
    run.receive(onChannel(42).u8(0, 2));
    EXPECT_EQ(run.doubles.log.errors(), std::vector<std::string>{"Invalid log type: 2. Dropping."});
    EXPECT_EQ(run.at("kChannel"), Value("42"));
    run.generator->generateLogUsingState(run.state);
    EXPECT_EQ(run.state.at("DisplayState").data()->size(), 50u);
}

TEST(C2KRouting, AnExtraCodeRecordReachesNoDecoder)
{
    C2KRun run;
    run.receive(onChannel(42).u8(0, 0xFF));
    EXPECT_EQ(run.doubles.log.errors(), std::vector<std::string>{"Invalid log type: ff. Dropping."});
    EXPECT_EQ(run.at("kChannel"), Value(""));
}

TEST(C2KRouting, AForeignCodeIsNeitherShownNorKept)
{
    C2KRun run;
    const Value before = deepCopy(run.receive(record(0x1184, 50)).display());
    EXPECT_EQ(run.display(), before);
    run.generator->generateLogUsingState(run.state);
    EXPECT_TRUE(run.state.at("DisplayState").data()->empty());
}

TEST(C2KRouting, APrefixIsRemovedFromWhatIsDecodedAndKept)
{
    C2KRun run;
    std::vector<std::byte> message{std::byte{0x81}, std::byte{0x07}};
    const auto status = onChannel(99);
    message.insert(message.end(), status.bytes().begin(), status.bytes().end());
    run.generator->updateState(run.state, message);
    EXPECT_EQ(run.at("kChannel"), Value("99"));
    run.generator->generateLogUsingState(run.state);
    EXPECT_EQ(run.state.at("DisplayState").data()->size(), 50u);
}

TEST(C2KRouting, TwelveBytesAreNoRecord)
{
    C2KRun run;
    run.receive(record(0x1183, 13).length(12));
    EXPECT_TRUE(run.doubles.log.errors().empty());
    run.generator->generateLogUsingState(run.state);
    EXPECT_TRUE(run.state.at("DisplayState").data()->empty());
}

TEST(C2KRouting, ARecordOfAWrongLengthIsKeptForTheSnapshot)
{
    C2KRun run;
    run.receive(record(0x1183, 49));
    run.generator->generateLogUsingState(run.state);
    EXPECT_EQ(run.state.at("DisplayState").data()->size(), 49u);
}

TEST(C2KGenerator, AsksForItsEightCodesAndNoExtraOnes)
{
    EXPECT_EQ(Value(C2KRun().generator->getStartCommand()),
              Value(makeDictionary({{"SetState", "Streaming"},
                                    {"SetZephraLogCodes",
                                     makeArray({0x108A, 0x1183, 0x1192, 0x12B6, 0x119C, 0x119D, 0x127E, 0x134F})}})));
}

TEST(C2KGenerator, ShowsItsDisplayFromTheFirstRefreshOn)
{
    C2KRun run;
    const Value first = run.generator->generateLogUsingState(run.state);
    ASSERT_TRUE(first.dictionary());
    EXPECT_EQ(first.dictionary(), run.display().dictionary());
}

TEST(C2KGenerator, ContinuesOnTheDisplayOfAnEarlierOne)
{
    C2KRun run;
    run.receive(onChannel(1));
    const auto before = run.display().dictionary();
    run.generator = C2KLogGenerator::generator(run.doubles.roles);
    run.receive(onChannel(2));
    EXPECT_EQ(run.display().dictionary(), before);
    EXPECT_EQ(run.at("kChannel"), Value("2"));
}

TEST(C2KGenerator, SavesItsHistoryAndADlfOfTheEightCodesAlone)
{
    C2KRun run;
    run.receive(onChannel(1)).receive(record(0x1184, 20)).receive(record(0x12B6, 25));
    run.generator->generateLogUsingState(run.state);
    const auto contents = run.generator->getSaveContentsFromState(run.state);
    ASSERT_EQ(contents->size(), 2u);
    const auto dlf = (*contents)[1].dictionary();
    EXPECT_EQ(dlf->at("Description"), Value("DLF binary (235 bytes)")); // 161 + 50 + 25 - 1
    EXPECT_EQ(dlf->at("DLF").data()->size(), 235u);
}

} // namespace
} // namespace kestrum
