#include "LogGenerator/GSM/GSMLogGenerator.h"

#include "LogGenerator/Failures.h"
#include "core/KestrumModelNode.h"
#include "doubles/DecodingDoubles.h"
#include "platform/propertylist/PropertyListCodec.h"

#include <gmock/gmock.h>

namespace kestrum {
namespace {

using testing::ElementsAre;

class ObjectStream : public testing::Test {
protected:
    void receive(const Value& list) { receive(codec.toXml(list)->bytes()); }
    void receive(Bytes bytes) { generator->updateState(state, bytes); }
    Value display() const { return state.at("Display"); }

    DecodingDoubles doubles;
    PropertyListCodec codec;
    DecodingRoles roles{doubles.log, doubles.console, doubles.clock, doubles.bundle, codec};
    std::unique_ptr<GSMLogGenerator> generator = GSMLogGenerator::generator(roles);
    State state;
};

// Normalising the modem's tree.

Value tidied(const Value& received)
{
    return GSMLogGenerator::processObject(received);
}

TEST(ProcessObject, StringStays)
{
    EXPECT_EQ(tidied("GSM"), Value("GSM"));
}

TEST(ProcessObject, FirstOfThreeElementsIsLeftOut)
{
    EXPECT_EQ(tidied(makeArray({"a", "b", "c"})), Value(makeArray({"b", "c"})));
}

TEST(ProcessObject, ArrayOfOneBecomesEmpty)
{
    EXPECT_EQ(tidied(makeArray({"a"})), Value(makeArray()));
}

TEST(ProcessObject, EmptyArrayStaysEmpty)
{
    EXPECT_EQ(tidied(makeArray()), Value(makeArray()));
}

TEST(ProcessObject, FirstElementIsNotEvenLookedAt)
{
    EXPECT_EQ(tidied(makeArray({42, "b"})), Value(makeArray({"b"})));
}

TEST(ProcessObject, WrapperOfOneStringGivesWayToIt)
{
    EXPECT_EQ(tidied(makeDictionary({{"Cell", makeDictionary({{"value", "17"}})}, {"RAT", "GSM"}})),
              Value(makeDictionary({{"Cell", "17"}, {"RAT", "GSM"}})));
}

TEST(ProcessObject, RootOfOneEntryStays)
{
    EXPECT_EQ(tidied(makeDictionary({{"Cell", "17"}})), Value(makeDictionary({{"Cell", "17"}})));
}

TEST(ProcessObject, ChainOfWrappersCollapsesToItsInnermostValue)
{
    const Value chain = makeDictionary({{"b", makeDictionary({{"c", makeDictionary({{"d", "x"}})}})}});
    EXPECT_EQ(tidied(makeDictionary({{"a", chain}, {"e", "y"}})), Value(makeDictionary({{"a", "x"}, {"e", "y"}})));
}

TEST(ProcessObject, WrapperOfAnArrayGivesWayToTheTidiedArray)
{
    EXPECT_EQ(tidied(makeDictionary({{"a", makeDictionary({{"b", makeArray({"x", "y"})}})}})),
              Value(makeDictionary({{"a", makeArray({"y"})}})));
}

TEST(ProcessObject, WrappersInAnArrayCollapse)
{
    EXPECT_EQ(tidied(makeArray({"first", makeDictionary({{"a", "x"}}), makeDictionary({{"a", "x"}, {"b", "y"}})})),
              Value(makeArray({"x", makeDictionary({{"a", "x"}, {"b", "y"}})})));
}

TEST(ProcessObject, EmptyDictionaryIsNoWrapper)
{
    EXPECT_EQ(tidied(makeDictionary({{"a", makeDictionary()}})), Value(makeDictionary({{"a", makeDictionary()}})));
}

TEST(ProcessObject, LeavesWhatItWasGivenAlone)
{
    const Value received = makeDictionary({{"a", makeDictionary({{"b", makeArray({"x", "y"})}})}});
    const Value before = deepCopy(received);
    tidied(received);
    EXPECT_EQ(received, before);
}

TEST(CanCollapse, OnlyADictionaryOfOneEntry)
{
    EXPECT_EQ(GSMLogGenerator::canCollapse(makeDictionary({{"a", "x"}})), Value("x"));
    EXPECT_TRUE(GSMLogGenerator::canCollapse(makeDictionary()).isNull());
    EXPECT_TRUE(GSMLogGenerator::canCollapse(makeDictionary({{"a", "x"}, {"b", "y"}})).isNull());
    EXPECT_TRUE(GSMLogGenerator::canCollapse(makeArray({"x"})).isNull());
    EXPECT_TRUE(GSMLogGenerator::canCollapse("x").isNull());
}

class UnknownObject : public testing::TestWithParam<Value> {};

TEST_P(UnknownObject, FailsTheAssertion)
{
    const std::string kind(nameOf(GetParam().kind()));
    try {
        tidied(makeDictionary({{"a", makeArray({"first", GetParam()})}}));
        FAIL() << "not thrown";
    } catch (const AssertionFailure& failure) {
        EXPECT_EQ(failure.description(), "Unknown object of type " + kind + " encountered");
        EXPECT_EQ(failure.file(), "LogGenerator/GSM/GSMLogGenerator");
        EXPECT_EQ(failure.line(), 78);
        EXPECT_EQ(failure.what(), "Assertion failure in processObject: of GSMLogGenerator, "
                                  "LogGenerator/GSM/GSMLogGenerator:78: Unknown object of type " +
                                      kind + " encountered");
    }
}

INSTANTIATE_TEST_SUITE_P(Kinds, UnknownObject,
                         testing::Values(Value(42), Value(2.5), Value(true), Value(Date()), Value(Data())),
                         [](const auto& each) { return std::string(nameOf(each.param.kind())); });

TEST(AssertionFailureReport, NamesAnUnknownFile)
{
    EXPECT_STREQ(AssertionFailure("op", "Object", "", 3, "why").what(),
                 "Assertion failure in op of Object, <Unknown File>:3: why");
    EXPECT_EQ(AssertionFailure("op", "Object", "", 3, "why").file(), "<Unknown File>");
}

// Messages.

TEST_F(ObjectStream, MessageBecomesTheDisplay)
{
    const Value received = makeDictionary({{"RAT", "GSM"}, {"Neighbors", makeArray({"header", "one", "two"})}});
    receive(received);
    EXPECT_EQ(display(), Value(makeDictionary({{"RAT", "GSM"}, {"Neighbors", makeArray({"one", "two"})}})));
    EXPECT_EQ(state.at("DisplayState"), received);
    EXPECT_EQ(state.at("ExtraInfo"), Value(makeDictionary()));
}

TEST_F(ObjectStream, EachMessageReplacesTheWholeDisplay)
{
    receive(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    const auto first = display().dictionary();
    state.at("ExtraInfo").dictionary()->set("note", "x");
    receive(makeDictionary({{"RAT", "UMTS"}, {"Set", "1"}}));
    EXPECT_EQ(display(), Value(makeDictionary({{"RAT", "UMTS"}, {"Set", "1"}})));
    EXPECT_EQ(Value(first), Value(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}})));
    EXPECT_EQ(state.at("ExtraInfo"), Value(makeDictionary()));
}

TEST_F(ObjectStream, RootMayBeAStringOrAnArray)
{
    receive("No service");
    EXPECT_EQ(generator->generateLogUsingState(state), Value("No service"));
    receive(makeArray({"header", "one"}));
    EXPECT_EQ(generator->generateLogUsingState(state), Value(makeArray({"one"})));
}

TEST_F(ObjectStream, BinaryPropertyListIsReadToo)
{
    // {"a": "b", "c": "d"}
    const std::string list(
        "bplist00\xD2\x01\x02\x03\x04\x51"
        "a\x51"
        "c\x51"
        "b\x51"
        "d\x08\x0D\x0F\x11\x13\0\0\0\0\0\0\x01\x01\0\0\0\0\0\0\0\x05\0\0\0\0\0\0\0\0\0\0\0\0\0\0\0\x15",
        58);
    receive(bytesOf(list));
    EXPECT_EQ(display(), Value(makeDictionary({{"a", "b"}, {"c", "d"}})));
}

TEST_F(ObjectStream, BytesThatAreNoPropertyListFailAndTheDisplayStays)
{
    receive(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    for (const std::string bad : {"", "nonsense", "<plist><dict>", "bplist00"}) {
        try {
            receive(bytesOf(bad));
            FAIL() << "not thrown";
        } catch (const AssertionFailure& failure) {
            EXPECT_EQ(failure.description(), "Could not deserialize the object");
            EXPECT_EQ(failure.file(), "LogGenerator/GSM/GSMLogGenerator");
            EXPECT_EQ(failure.line(), 90);
            EXPECT_STREQ(failure.what(), "Assertion failure in updateState:withData: of <GSMLogGenerator: 0x0>, "
                                         "LogGenerator/GSM/GSMLogGenerator:90: Could not deserialize the object");
        }
    }
    EXPECT_EQ(display(), Value(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}})));
}

TEST_F(ObjectStream, NumberInAMessageFailsAndTheStateStays)
{
    receive(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    EXPECT_THROW(receive(makeDictionary({{"RSSI", -71}, {"RAT", "UMTS"}})), AssertionFailure);
    const Value kept = makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}});
    EXPECT_EQ(display(), kept);
    EXPECT_EQ(state.at("DisplayState"), kept);
}

TEST_F(ObjectStream, HundredThousandLevelsFailAndTheNextMessageIsServed)
{
    std::string nested = "<plist version=\"1.0\">";
    for (int i = 0; i < 100'000; ++i)
        nested += "<array>";
    EXPECT_THROW(receive(bytesOf(nested)), AssertionFailure);
    for (int i = 0; i < 100'000; ++i)
        nested += "</array>";
    EXPECT_THROW(receive(bytesOf(nested + "</plist>")), AssertionFailure);
    receive(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    EXPECT_EQ(display().dictionary()->at("RAT"), Value("GSM"));
}

TEST_F(ObjectStream, DeepestListThatIsReadIsShown)
{
    Value nested = makeArray({"first", "bottom"});
    for (std::size_t i = 1; i < PropertyListCodec::kMaxDepth; ++i)
        nested = makeArray({"first", nested});
    receive(nested);
    PathDictionary paths;
    auto node = KestrumModelNode::makeTreeFromObject(generator->generateLogUsingState(state), paths);
    std::size_t levels = 1;
    for (; node->childNodes() != nullptr; node = node->childNodes()->front())
        ++levels;
    EXPECT_EQ(levels, PropertyListCodec::kMaxDepth + 1);
}

// The other roles of a generator.

TEST_F(ObjectStream, CreationIsLogged)
{
    EXPECT_THAT(doubles.log.lines, ElementsAre(RecordingLog::Line(Priority::Warning, "Creating Log object: 0x0")));
}

TEST_F(ObjectStream, StartCommandAsksForTheStreamAlone)
{
    EXPECT_EQ(Value(generator->getStartCommand()), Value(makeDictionary({{"SetState", "Streaming"}})));
}

TEST_F(ObjectStream, NothingReceivedShowsNothing)
{
    EXPECT_TRUE(generator->generateLogUsingState(state).isNull());
}

TEST_F(ObjectStream, ShowingRollsTheHistory)
{
    for (int i = 1; i <= 6; ++i) {
        receive(makeDictionary({{"Count", std::to_string(i)}, {"RAT", "GSM"}}));
        generator->generateLogUsingState(state);
    }
    const auto contents = generator->getSaveContentsFromState(state);
    ASSERT_EQ(contents->size(), 5u);
    EXPECT_EQ((*contents)[0].dictionary()->at("DisplayState").dictionary()->at("Count"), Value("2"));
    EXPECT_EQ((*contents)[4].dictionary()->at("Display").dictionary()->at("Count"), Value("6"));
}

TEST_F(ObjectStream, HistoryKeepsTheMessageOfItsTime)
{
    const auto message = [](const std::string& cell) {
        return Value(makeDictionary({{"RAT", "GSM"}, {"Cells", makeArray({"Head", makeDictionary({{"ID", cell}})})}}));
    };
    for (int cell = 1; cell <= 5; ++cell) {
        receive(message(std::to_string(cell)));
        generator->generateLogUsingState(state);
        receive(message("between"));
        receive(message("the refreshes"));
    }
    const auto history = state.at("History").array();
    ASSERT_EQ(history->size(), 5u);
    for (int cell = 1; cell <= 5; ++cell)
        EXPECT_EQ((*history)[static_cast<std::size_t>(cell) - 1].dictionary()->at("DisplayState"),
                  message(std::to_string(cell)));
}

TEST_F(ObjectStream, SavingGivesTheHistoryAlone)
{
    EXPECT_TRUE(generator->getSaveContentsFromState(state)->empty());
    receive(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    generator->generateLogUsingState(state);
    const auto contents = generator->getSaveContentsFromState(state);
    ASSERT_EQ(contents->size(), 1u);
    EXPECT_FALSE((*contents)[0].dictionary()->contains("DLF"));
    contents->clear();
    EXPECT_EQ(state.at("History").array()->size(), 1u);
}

// A display that another technology left.

TEST_F(ObjectStream, FirstMessagePutsAForeignDisplayAside)
{
    const auto foreign = makeDictionary({{"Radio", "x"}});
    state.set("Display", foreign);
    state.set("Template", makeDictionary());
    state.set("DisplayOrigin", makeDictionary({{"Technology", "another"}, {"Display", foreign}}));
    ASSERT_TRUE(generator->replacesDisplayOf(state));

    receive(makeDictionary({{"RAT", "GSM"}, {"Cell", "17"}}));
    EXPECT_EQ(display().dictionary()->at("RAT"), Value("GSM"));
    EXPECT_FALSE(state.contains("Template"));
    EXPECT_FALSE(generator->replacesDisplayOf(state));
}

TEST_F(ObjectStream, ForeignDisplayIsNotShownBeforeTheFirstMessage)
{
    const auto foreign = makeDictionary({{"Radio", "x"}});
    state.set("Display", foreign);
    state.set("DisplayOrigin", makeDictionary({{"Technology", "another"}, {"Display", foreign}}));
    EXPECT_TRUE(generator->generateLogUsingState(state).isNull());
}

} // namespace
} // namespace kestrum
