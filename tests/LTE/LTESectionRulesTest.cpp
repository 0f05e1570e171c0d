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

/// A random record of one of the rules' codes, or of the cell monitor.
LogCode arbitraryCode()
{
    return *rc::gen::element<LogCode>(0xB0C1, 0xB0C2, 0xB179, 0xB17F, 0xB180, 0xB186, 0xFF0001, 0xFF0002);
}

RC_GTEST_PROP(HostileLTERecords, NeverPublishUnderANameThatTheSectionLacks, ())
{
    TechnologyRun<LTELogGenerator> run("LTE");
    for (int i = 0; i < 4; ++i)
        run.receive(arbitraryRecord(arbitraryCode(), *rc::gen::inRange<std::size_t>(13, 400)).bytes());
    run.receive(arbitraryCellMonitor(run.codec));
    for (const auto& shape : kShapes)
        RC_ASSERT(holdsOnlyKeysOf(shape, run.section(shape.name)));
}

RC_GTEST_PROP(HostileLTERecords, ThatAreShortChangeNothing, ())
{
    TechnologyRun<LTELogGenerator> run("LTE");
    run.receive(arbitraryRecord(0xB180, 61).bytes());
    const Value before = deepCopy(run.display());
    const auto& rule = kRules[*rc::gen::inRange<std::size_t>(0, std::size(kRules))];
    run.receive(arbitraryRecord(rule.code, *rc::gen::inRange<std::size_t>(13, rule.minimumLength)).bytes());
    RC_ASSERT(run.display() == before);
}

RC_GTEST_PROP(HostileLTERecords, OfAnyBytesAreHarmless, (const std::vector<std::uint8_t>& bytes))
{
    TechnologyRun<LTELogGenerator> run("LTE");
    try {
        run.receive(std::as_bytes(std::span(bytes)));
    } catch (const LogCode_0xFF0000::UnknownDataException&) {
        // What a SIM record without a dictionary ends in.
    }
    RC_ASSERT(!run.display().isNull());
}

} // namespace
} // namespace kestrum
