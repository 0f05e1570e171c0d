#include "LogGenerator/LTE/LTEClassIndex.h"
#include "LogGenerator/LTE/LTELogGenerator.h"

#include "doubles/SectionRules.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

namespace kestrum {
namespace {

using Kind = Value::Kind;

const SectionShape kShapes[] = {
    {"Serving Cell Info",
     Kind::Dictionary,
     {"Physical Cell ID", "Download Frequency", "Upload Frequency", "Download Bandwidth", "Upload Bandwidth",
      "Cell Identity", "Tracking Area Code", "Freq Band Indicator", "Num Tx Antennas", "UARFCN"}},
    {"Connected mode LTE Intra-frequency Measurement",
     Kind::Dictionary,
     {"E-ARFCN", "Serving Physical Cell ID", "Subframe Number", "Serving Filtered RSRP", "Serving Filtered RSRQ"}},
    {"Measured Neighbor Cells", Kind::Array, {"Physical Cell ID", "Filtered RSRP", "Filtered RSRQ"}},
    {"Detected Cells", Kind::Array, {"Physical Cell ID"}},
    {"Serving Cell Measurements",
     Kind::Dictionary,
     {"Version", "E-ARFCN", "Physical Cell ID", "Serving Layer Priority", "Measured RSRP", "Average RSRP",
      "Measured RSRQ", "Average RSRQ", "Measured RSSI", "Qrxlevmin", "P_Max", "Max UE Tx Power", "Srxlev",
      "Num of Consecutive DRX Cycles of S < 0", "S Intra Search", "S Non Intra Search", "Measurement Rules Updated",
      "Measurement Rules"}},
    {"Neighbor Measurements", Kind::Dictionary, {"Version", "E-ARFCN", "Qrxlevmin"}},
    {"Neighbor Cells List",
     Kind::Array,
     {"Physical Cell ID", "Measured RSSI", "Measured RSRP", "Average RSRP", "Measured RSRQ", "Average RSRQ", "Srxlev",
      "Frequency Offset", "Ant 0 Frame Offset", "Ant 0 Sample Offset", "Ant 1 Frame Offset", "Ant 1 Sample Offset"}},
    {"Reselection Candidates", Kind::Dictionary, {"Version", "Serving EARFCN", "Serving Cell ID"}},
    {"Reselection Candidates List",
     Kind::Array,
     {"Candidate Priority", "Candidate RAT Type", "E ARFCN", "Cell ID", "U ARFCN", "PSC", "ARFCN", "Band", "BSIC ID",
      "Channel", "Pilot"}},
};

const SectionRule kRules[] = {
    {"Antennas", "Serving Cell Info", 0xB0C1, 22},
    {"ServingCell", "Serving Cell Info", 0xB0C2, 38},
    {"ConnectedMode", "Connected mode LTE Intra-frequency Measurement", 0xB179, 29},
    {"MeasuredNeighbors", "Measured Neighbor Cells", 0xB179, 29},
    {"DetectedCells", "Detected Cells", 0xB179, 29},
    {"ServingMeasurements", "Serving Cell Measurements", 0xB17F, 33},
    {"NeighborMeasurements", "Neighbor Measurements", 0xB180, 21},
    {"NeighborCells", "Neighbor Cells List", 0xB180, 21},
    {"Reselection", "Reselection Candidates", 0xB186, 21},
    {"ReselectionList", "Reselection Candidates List", 0xB186, 21},
};

class LTESectionRule : public SectionOfIndex<LTEClassIndex> {
protected:
    LTESectionRule() : SectionOfIndex(kShapes) {}
};

TEST_P(LTESectionRule, ChangesNothingOneByteShort)
{
    expectNoChangeOneByteShort();
}

TEST_P(LTESectionRule, ShowsRecordsOfTheLeastLengthAndLongerOnes)
{
    expectRecordsOfAtLeastTheMinimumToShow();
}

TEST_P(LTESectionRule, ReportsForeignCodesAndChangesNothing)
{
    expectNoChangeByForeignCodes(true);
}

TEST_P(LTESectionRule, IsHarmlessWithoutANodeAndOnOneOfTheOtherShape)
{
    expectNoHarmWithoutANodeOrOnOneOfTheOtherShape();
}

INSTANTIATE_TEST_SUITE_P(LTE, LTESectionRule, testing::ValuesIn(kRules),
                         [](const auto& each) { return std::string(each.param.name); });

TEST(LTETemplate, HoldsEverySectionWithItsKeys)
{
    expectTemplateToHold(TechnologyRun<LTELogGenerator>::resource("LTE"), kShapes);
}

const HostileRecords<LTELogGenerator> kHostile{"LTE", kShapes, kRules, 400};

RC_GTEST_PROP(HostileLTERecords, NeverPublishUnderANameThatTheSectionLacks, ())
{
    kHostile.neverPublishUnderANameThatTheSectionLacks();
}

RC_GTEST_PROP(HostileLTERecords, ThatAreShortChangeNothing, ())
{
    kHostile.changeNothingWhenTheyAreShort();
}

RC_GTEST_PROP(HostileLTERecords, OfAnyBytesAreHarmless, (const std::vector<std::uint8_t>& bytes))
{
    kHostile.areHarmlessWhateverTheirBytes(bytes);
}

} // namespace
} // namespace kestrum
