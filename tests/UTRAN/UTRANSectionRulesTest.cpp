#include "LogGenerator/UTRAN/UTRANClassIndex.h"
#include "LogGenerator/UTRAN/UTRANLogGenerator.h"

#include "doubles/SectionRules.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

namespace kestrum {
namespace {

using Kind = Value::Kind;

const SectionShape kShapes[] = {
    {"RRC Info", Kind::Dictionary, {"State"}},
    {"Serving Cell Info",
     Kind::Dictionary,
     {"Cell Access Restrictions", "Cell ID", "Downlink UARFCN", "Uplink UARFCN", "URA ID", "Allowed Access",
      "Local Area Code", "Freq Band Indicator", "Cell Scrambling Code"}},
    {"Neighbor Cell List", Kind::Array, {"UARFCN", "Cell ID", "Filter RSCP", "Status", "inJDCS"}},
    {"GSM Neighbor Cell List", Kind::Array, {}},
    {"TRCH BLER", Kind::Array, {"TRCH ID", "TRCH BLER Measurement"}},
    {"CCTRCH SIR", Kind::Array, {"CCTRCH ID", "TSNUM", "SIR"}},
};

// Without 0xD0E0, which is shown however short it is.
const SectionRule kRules[] = {
    {"ServingCell", "Serving Cell Info", 0xD0E2, 26},       {"Neighbors", "Neighbor Cell List", 0xD00A, 21},
    {"GsmNeighbors", "GSM Neighbor Cell List", 0xD00E, 17}, {"TransportChannels", "TRCH BLER", 0xD00C, 17},
    {"CompositeChannels", "CCTRCH SIR", 0xD00C, 17},
};

class UTRANSectionRule : public SectionOfIndex<UTRANClassIndex> {
protected:
    UTRANSectionRule() : SectionOfIndex(kShapes) {}
};

TEST_P(UTRANSectionRule, ChangesNothingOneByteShort)
{
    expectNoChangeOneByteShort();
}

TEST_P(UTRANSectionRule, ShowsRecordsOfTheLeastLengthAndLongerOnes)
{
    expectRecordsOfAtLeastTheMinimumToShow();
}

TEST_P(UTRANSectionRule, IgnoresForeignCodesWithoutAWord)
{
    expectNoChangeByForeignCodes(false);
}

TEST_P(UTRANSectionRule, IsHarmlessWithoutANodeAndOnOneOfTheOtherShape)
{
    expectNoHarmWithoutANodeOrOnOneOfTheOtherShape();
}

INSTANTIATE_TEST_SUITE_P(UTRAN, UTRANSectionRule, testing::ValuesIn(kRules),
                         [](const auto& each) { return std::string(each.param.name); });

TEST(UTRANTemplate, HoldsEverySectionWithItsKeys)
{
    expectTemplateToHold(TechnologyRun<UTRANLogGenerator>::resource("UTRAN"), kShapes);
}

RC_GTEST_PROP(HostileUTRANRecords, NeverPublishUnderANameThatTheSectionLacks, ())
{
    TechnologyRun<UTRANLogGenerator> run("UTRAN");
    for (int i = 0; i < 4; ++i) {
        const auto code = *rc::gen::element<LogCode>(0xD0E0, 0xD0E2, 0xD00A, 0xD00E, 0xD00C, 0xFF0001, 0xFF0002);
        run.receive(arbitraryRecord(code, *rc::gen::inRange<std::size_t>(13, 700)).bytes());
    }
    run.receive(arbitraryCellMonitor(run.codec));
    for (const auto& shape : kShapes)
        RC_ASSERT(holdsOnlyKeysOf(shape, run.section(shape.name)));
}

RC_GTEST_PROP(HostileUTRANRecords, ThatAreShortChangeNothing, ())
{
    TechnologyRun<UTRANLogGenerator> run("UTRAN");
    run.receive(arbitraryRecord(0xD00A, 200).bytes());
    const Value before = deepCopy(run.display());
    const auto& rule = kRules[*rc::gen::inRange<std::size_t>(0, std::size(kRules))];
    run.receive(arbitraryRecord(rule.code, *rc::gen::inRange<std::size_t>(13, rule.minimumLength)).bytes());
    RC_ASSERT(run.display() == before);
}

RC_GTEST_PROP(HostileUTRANRecords, OfAnyBytesAreHarmless, (const std::vector<std::uint8_t>& bytes))
{
    TechnologyRun<UTRANLogGenerator> run("UTRAN");
    try {
        run.receive(std::as_bytes(std::span(bytes)));
    } catch (const LogCode_0xFF0000::UnknownDataException&) {
        // What a SIM record without a dictionary ends in.
    }
    RC_ASSERT(!run.display().isNull());
}

} // namespace
} // namespace kestrum
