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

// Without 0xD0E0, whose records are shown at any length.
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

const HostileRecords<UTRANLogGenerator> kHostile{"UTRAN", kShapes, kRules, 700};

RC_GTEST_PROP(HostileUTRANRecords, NeverPublishUnderANameThatTheSectionLacks, ())
{
    kHostile.neverPublishUnderANameThatTheSectionLacks();
}

RC_GTEST_PROP(HostileUTRANRecords, ThatAreShortChangeNothing, ())
{
    kHostile.changeNothingWhenTheyAreShort();
}

RC_GTEST_PROP(HostileUTRANRecords, OfAnyBytesAreHarmless, (const std::vector<std::uint8_t>& bytes))
{
    kHostile.areHarmlessWhateverTheirBytes(bytes);
}

} // namespace
} // namespace kestrum
