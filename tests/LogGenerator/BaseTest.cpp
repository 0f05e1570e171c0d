#include "LogGenerator/Base.h"

#include "doubles/CountedArrayLock.h"
#include "doubles/DecodingDoubles.h"
#include "platform/RecordWatch.h"

#include <gmock/gmock.h>
#include <rapidcheck/gtest.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

// The scale of the energy ratio.

struct Ratio {
    std::uint32_t linear;
    int decibels;

    friend void PrintTo(const Ratio& shown, std::ostream* out) { *out << shown.linear; }
};

class LookUpECNO : public testing::TestWithParam<Ratio> {};

TEST_P(LookUpECNO, IsInWholeDecibels)
{
    EXPECT_EQ(Base::lookUpECNO(GetParam().linear), GetParam().decibels);
}

INSTANTIATE_TEST_SUITE_P(Steps, LookUpECNO,
                         testing::Values(Ratio{0xFFFFFFFF, 0}, Ratio{524289, 0}, Ratio{524288, 0}, Ratio{524287, -1},
                                         Ratio{417648, -1}, Ratio{417647, -2}, Ratio{331809, -2}, Ratio{331808, -3},
                                         Ratio{263625, -3}, Ratio{263624, -4}, Ratio{209464, -4}, Ratio{209463, -5},
                                         Ratio{166442, -5}, Ratio{166441, -6}, Ratio{132269, -6}, Ratio{132268, -7},
                                         Ratio{105124, -7}, Ratio{105123, -8}, Ratio{83563, -8}, Ratio{83562, -9},
                                         Ratio{66436, -9}, Ratio{66435, -10}, Ratio{52831, -10}, Ratio{52830, -11},
                                         Ratio{42024, -11}, Ratio{42023, -12}, Ratio{33441, -12}, Ratio{33440, -13},
                                         Ratio{26622, -13}, Ratio{26621, -14}, Ratio{21206, -14}, Ratio{21205, -15},
                                         Ratio{16904, -15}, Ratio{16903, -16}, Ratio{13487, -16}, Ratio{13486, -17},
                                         Ratio{10772, -17}, Ratio{10771, -18}, Ratio{8616, -18}, Ratio{8615, -19},
                                         Ratio{6903, -19}, Ratio{6902, -20}, Ratio{5543, -20}, Ratio{5542, -21}),
                         [](const auto& each) { return std::to_string(each.param.linear); });

INSTANTIATE_TEST_SUITE_P(LowSteps, LookUpECNO,
                         testing::Values(Ratio{4462, -21}, Ratio{4461, -22}, Ratio{3604, -22}, Ratio{3603, -23},
                                         Ratio{2922, -23}, Ratio{2921, -24}, Ratio{2241, -24}, Ratio{2240, -25},
                                         Ratio{1950, -25}, Ratio{1949, -26}, Ratio{1608, -26}, Ratio{1607, -27},
                                         Ratio{1337, -27}, Ratio{1336, -28}, Ratio{1121, -28}, Ratio{1120, -29},
                                         Ratio{950, -29}, Ratio{949, -30}, Ratio{814, -30}, Ratio{813, -31},
                                         Ratio{757, -31}, Ratio{756, -31}, Ratio{706, -31}, Ratio{705, 0}, Ratio{1, 0},
                                         Ratio{0, 0}),
                         [](const auto& each) { return std::to_string(each.param.linear); });

RC_GTEST_PROP(LookUpECNO, RisesWithTheRatioInsideTheScale, ())
{
    const auto one = *rc::gen::inRange<std::uint32_t>(706, 524289);
    const auto other = *rc::gen::inRange<std::uint32_t>(706, 524289);
    RC_ASSERT(Base::lookUpECNO(std::min(one, other)) <= Base::lookUpECNO(std::max(one, other)));
}

// A section with two codes, one of them twice.
constexpr Row kRows[] = {{u8(13), "Channel", decimalSigned32}};
constexpr Layout kLayouts[] = {
    {.code = 0x4005, .minimumLength = 20, .rows = kRows},
    {.code = 0xFF0002},
    {.code = 0x4005, .minimumLength = 30},
};
constexpr SectionTraits kTraits{.name = "Serving Cell", .layouts = kLayouts};

constexpr Row kCell[] = {{u8(0), "Cell", decimalSigned32}};

class Section : public Base {
public:
    explicit Section(DecodingRoles& decodingRoles, const SectionTraits& traits = kTraits) : Base(decodingRoles, traits)
    {}
    using Base::publish;
    using Base::sectionRef;
};

class BaseOf : public testing::Test {
protected:
    DecodingDoubles doubles;
    Section section{doubles.roles};
};

TEST_F(BaseOf, SectionRegistersUnderItsNameAndItsCodes)
{
    ClassDictionary classes;
    CodeDictionary codes;
    section.initWithDict(classes, codes);
    EXPECT_EQ(classes.size(), 1u);
    EXPECT_EQ(classes.at("Serving Cell"), &section);
    EXPECT_EQ(codes.size(), 2u);
    EXPECT_THAT(codes.at(0x4005), ElementsAre(&section, &section));
    EXPECT_THAT(codes.at(0xFF0002), ElementsAre(&section));
    EXPECT_EQ(doubles.log.count("Array Count: 3"), 1u);
}

TEST_F(BaseOf, SectionLogsItsNameWhenItGetsItsNode)
{
    section.updateSectionRef(makeDictionary());
    EXPECT_THAT(doubles.log.lines, ElementsAre(RecordingLog::Line(Priority::Warning, "Serving Cell")));
}

TEST_F(BaseOf, SectionDoesNotOwnItsNode)
{
    auto node = makeDictionary();
    section.updateSectionRef(node);
    EXPECT_EQ(node.use_count(), 1);
    node.reset();
    EXPECT_EQ(section.sectionRef.dictionary(), nullptr);
    section.publish("RSSI", "-71 dBm"); // has no effect
}

TEST_F(BaseOf, SectionWithoutANodeDecodesWithoutHarm)
{
    section.publish("RSSI", "-71 dBm");
    Base::clearElementsInArray(section.sectionRef);
    Base::replaceArray(section.sectionRef, {"x"});
    EXPECT_EQ(section.sectionRef.array(), nullptr);
}

TEST_F(BaseOf, PublishingReplacesTheKeyAndKeepsTheOthers)
{
    auto node = makeDictionary({{"Mode", "idle"}, {"RSSI", "-80 dBm"}});
    section.updateSectionRef(node);
    section.publish("RSSI", "-71 dBm");
    EXPECT_EQ(Value(node), Value(makeDictionary({{"Mode", "idle"}, {"RSSI", "-71 dBm"}})));
}

TEST_F(BaseOf, ListIsRewrittenUnderTheLock)
{
    const CountedArrayLock counts;
    auto node = makeArray({"a", "b", "c"});
    section.updateSectionRef(node);
    Base::replaceArray(section.sectionRef, {"d", "e"});
    EXPECT_EQ(Value(node), Value(makeArray({"d", "e"})));
    EXPECT_EQ(counts.locked, 1);
    EXPECT_EQ(counts.unlocked, 1);
}

TEST_F(BaseOf, ReplacingByNothingLeavesTheListEmpty)
{
    auto node = makeArray({"a"});
    section.updateSectionRef(node);
    Base::replaceArray(section.sectionRef, {});
    EXPECT_TRUE(node->empty());
}

TEST_F(BaseOf, ListIsClearedUnderTheLock)
{
    const CountedArrayLock counts;
    auto node = makeArray({"a", "b"});
    section.updateSectionRef(node);
    Base::clearElementsInArray(section.sectionRef);
    EXPECT_TRUE(node->empty());
    EXPECT_EQ(counts.locked, 1);
    EXPECT_EQ(counts.unlocked, 1);
}

TEST_F(BaseOf, EmptyListIsClearedUnderTheLockToo)
{
    const CountedArrayLock counts;
    auto node = makeArray();
    section.updateSectionRef(node);
    Base::clearElementsInArray(section.sectionRef);
    EXPECT_TRUE(node->empty());
    EXPECT_EQ(counts.locked, 1);
    EXPECT_EQ(counts.unlocked, 1);
}

TEST_F(BaseOf, NodeOfTheOtherShapeIsLeftAlone)
{
    auto dictionary = makeDictionary({{"a", "x"}});
    section.updateSectionRef(dictionary);
    Base::replaceArray(section.sectionRef, {"d"});
    EXPECT_EQ(dictionary->size(), 1u);
    auto array = makeArray({"a"});
    section.updateSectionRef(array);
    section.publish("RSSI", "-71 dBm");
    EXPECT_EQ(array->size(), 1u);
}

/// A record whose payload begins with 7.
std::vector<std::byte> recordOf(std::size_t length)
{
    std::vector<std::byte> bytes(length);
    bytes[13] = std::byte{7};
    return bytes;
}

TEST_F(BaseOf, RecordOfItsCodeAndLengthIsShown)
{
    auto node = makeDictionary();
    section.updateSectionRef(node);
    doubles.log.lines.clear();
    section.updateWithData(Record(recordOf(20)), 0x4005);
    EXPECT_THAT(doubles.log.lines, ElementsAre(RecordingLog::Line(Priority::Warning, "Serving Cell")));
    EXPECT_EQ(Value(node), Value(makeDictionary({{"Channel", "7"}})));
}

TEST_F(BaseOf, ShortRecordIsDroppedSilently)
{
    auto node = makeDictionary();
    section.updateSectionRef(node);
    section.updateWithData(Record(recordOf(19)), 0x4005);
    EXPECT_THAT(doubles.log.errors(), IsEmpty());
    EXPECT_TRUE(node->empty());
}

TEST_F(BaseOf, ShortRecordIsCountedOnceAndNoOtherIs)
{
    struct Watch : RecordWatch {
        void tooShort() override { ++count; }
        int count = 0;
    } watch;
    doubles.roles.watch = &watch;
    section.updateWithData(Record(recordOf(20)), 0x4005);
    section.updateWithData(Record(recordOf(14)), 0xFF0003);
    EXPECT_EQ(watch.count, 0);
    section.updateWithData(Record(recordOf(19)), 0x4005);
    EXPECT_EQ(watch.count, 1);
}

TEST_F(BaseOf, ForeignCodeIsReported)
{
    auto node = makeDictionary();
    section.updateSectionRef(node);
    section.updateWithData(Record(recordOf(20)), 0xFF0003);
    EXPECT_THAT(doubles.log.errors(), ElementsAre("Received an unknown log message: 16711683"));
    EXPECT_TRUE(node->empty());
}

TEST_F(BaseOf, SectionMayIgnoreForeignCodes)
{
    static constexpr SectionTraits kDeaf{
        .name = "Serving Cell", .layouts = kLayouts, .foreignCode = ForeignCode::Ignored};
    Section deaf(doubles.roles, kDeaf);
    deaf.updateWithData(Record(recordOf(20)), 0xFF0003);
    EXPECT_THAT(doubles.log.lines, ElementsAre(RecordingLog::Line(Priority::Warning, "Serving Cell")));
}

TEST_F(BaseOf, SectionMayDecodeForeignCodes)
{
    static constexpr SectionTraits kAnyCode{
        .name = "Serving Cell", .layouts = kLayouts, .foreignCode = ForeignCode::Decoded};
    struct AnyCode : Section {
        using Section::Section;
        void decode(Record, const Layout& layout) override { codes.push_back(layout.code); }
        std::vector<LogCode> codes;
    } anyCode(doubles.roles, kAnyCode);
    anyCode.updateWithData(Record(recordOf(14)), 0xFF0003);
    EXPECT_THAT(anyCode.codes, ElementsAre(0xFF0003u));
    EXPECT_THAT(doubles.log.errors(), IsEmpty());
}

TEST_F(BaseOf, EntryLineAndItsPriorityAreTheSections)
{
    static constexpr SectionTraits kWordy{
        .name = "Serving Cell", .layouts = kLayouts, .entryLine = "ServingCell", .entryPriority = Priority::Notice};
    Section(doubles.roles, kWordy).updateWithData(Record(recordOf(20)), 0xFF0003);
    EXPECT_EQ(doubles.log.lines.front(), RecordingLog::Line(Priority::Notice, "ServingCell"));
}

TEST_F(BaseOf, ListIsRewrittenByItsCount)
{
    static constexpr Layout kCells[] = {
        {.code = 0x4005, .minimumLength = 14, .rows = kCell, .list = {{u8(13), {14, 1}}}}};
    static constexpr SectionTraits kList{.name = "Cells", .layouts = kCells};
    static_assert(fits(kCells));
    auto node = makeArray({"left over"});
    Section list(doubles.roles, kList);
    list.updateSectionRef(node);
    std::vector<std::byte> bytes(17);
    bytes[13] = std::byte{2};
    bytes[14] = std::byte{7};
    bytes[15] = std::byte{8};
    list.updateWithData(Record(bytes), 0x4005);
    EXPECT_EQ(Value(node), Value(makeArray({makeDictionary({{"Cell", "7"}}), makeDictionary({{"Cell", "8"}})})));
}

// The compiler rejects layouts whose shortest record does not hold all fields.
constexpr Layout kFieldBeyondTheRecord[] = {{.code = 1, .minimumLength = 13, .rows = kRows}};
static_assert(!fits(kFieldBeyondTheRecord));
constexpr Layout kCountBeyondTheRecord[] = {
    {.code = 1, .minimumLength = 13, .rows = kCell, .list = {{u8(13), {14, 1}}}}};
static_assert(!fits(kCountBeyondTheRecord));
constexpr Row kWideCell[] = {{u16(0), "Cell", decimalSigned32}};
constexpr Layout kFieldBeyondTheElement[] = {
    {.code = 1, .minimumLength = 14, .rows = kWideCell, .list = {{u8(13), {14, 1}}}}};
static_assert(!fits(kFieldBeyondTheElement));

} // namespace
} // namespace kestrum
