#include "LogGenerator/ZPH_GSM/ZPH_GSMClassIndex.h"
#include "LogGenerator/ZPH_GSM/ZPH_GSMLogGenerator.h"

#include "sections/SectionContracts.h"

#include <gtest/gtest.h>

namespace kestrum {

using Kind = Value::Kind;

const TechnologyContract& technology()
{
    constexpr bool kKept = false; // the list of colour codes is only stored for the next measurements
    // clang-format off
    static const auto kTechnology = TechnologyContract::of<ZPH_GSMClassIndex, ZPH_GSMLogGenerator>("ZPH_GSM", 500, {
        {"ActiveSet", "Active Set", Kind::Array, "ActiveSet", {{0x417A, 16}},
         {"Scrambling Code", "RSCP", "Energy Per Chip"}},
        {"CodingScheme", "Coding Scheme", Kind::Dictionary, "CellChangeCounters", {}, {}, {}, false},
        {"GPRSInformation", "GPRS Information", Kind::Dictionary, "GPRSInformation",
         {{0x51F5, 18}, {0x7135, 32}, {0x51F6, 24}, {0x51FB, 34}, {0x51FD, 35}, {0x51F4, 15}, {0x5137, 29}},
         {"SI13 Position", "Network Control Order", "PFC Supported", "Priority Access Threshold", "T3192",
          "Access Burst Type", "DRX Timer Max", "PBCCH Present", "Ext Measurement Order", "Packet PSI Status",
          "Packet SI Status", "Count LR", "Count HR", "Network Operating Mode", "Cell Reselect Hysteresis"}},
        {"GSMServingCell", "GSM Serving Cell", Kind::Dictionary, "GSMServingCell",
         {{0x5134, 26}, {0x5137, 29}, {0x5076, 17}, {0xFF0001}},
         {"Cell ID", "ARFCN", "BSIC", "RSSI", "C1 Value", "C2 Value", "MA Dedicated ARFCN"}},
        {"MobileAllocation", "Mobile Allocation", Kind::Dictionary, "MobileAllocation", {{0x51F8, 15}},
         {"HSN", "ARFCNs"}},
        {"NeighboringCells", "Neighboring Cells", Kind::Array, "NeighboringCells",
         {{0x5137, 29}, {0x51FF, 15, kKept}, {0xFF0001}}, {"ARFCN", "RSSI", "C1 Value", "BSIC"}},
        kPdpContextList,
        {"ProcessPS", "Process PS", Kind::Dictionary, "ProcessPS", {{0x7130, 16}, {0x7132, 16}},
         {"MM State", "MM Sub State", "Attach Reject Cause", "MM Service State"}},
        {"UMTSRRMeasurement", "UMTS RR Measurement", Kind::Dictionary, "UMTSRRMeasurement", {}, {}, {}, false},
        {"CellChangeCounters", "Cell Change Counters", Kind::Dictionary, "CellChangeCounters", {}, {}, {}, false},
        {"DetectedSet", "Detected Set", Kind::Array, "DetectedSet", {{0x417A, 16}}, {}},
        {"GSMSet", "GSM Set", Kind::Array, "GSMSet", {{0x4005, 15}}, {"ARFCN", "BSIC", "RSSI", "Ranking Value"}},
        {"NonRankedGSMSet", "Non-Ranked GSM Set", Kind::Array, "NonRankedGSMSet", {}, {}, {}, false},
        {"ProcessCO", "Process CO", Kind::Dictionary, "ProcessCS", {{0x7131, 16}, {0x7132, 16}},
         {"MM State", "MM Service State"}},
        {"ServingPLMN", "Serving PLMN", Kind::Dictionary, "Serving PLMN", {{0x7135, 32}, {0x7132, 16}, {0xFF0001}},
         {"PLMN Sel Mod", "Mobile Country Code", "Mobile Network Code", "Location Area Code", "Routing Area Code",
          "Service Type"}},
        {"UMTSSet", "UMTS Set", Kind::Array, "UMTSSet", {{0x4005, 15}, {0xFF0001}},
         {"Scrambling Code", "RSCP", "Energy Per Chip", "Downlink Frequency", "Ranking Value", "Rank Cell RSCP",
          "UARFCN"}},
        {"EquivalentPLMNList", "Equivalent PLMN List", Kind::Array, "Equivalent PLMN List", {{0x7150, 17}},
         {"Mobile Country Code", "Mobile Network Code"}},
        {"GSMRRInfo", "GSM RR Info", Kind::Dictionary, "GSMRRInfo", {{0x512C, 17}, {0x5137, 29}, {0x5072, 20},
         {0x51F6, 24}},
         {"RR State", "RR Sub State", "RR Status", "RR Mode", "Serving Rx Level", "Rx Quality Full", "Rx Quality Sub",
          "DTX Used", "DRX Used"}},
        {"MonitoredSet", "Monitored Set", Kind::Array, "MonitoredSet", {{0x417A, 16}}, {}},
        {"NonRankedUMTSSet", "Non-Ranked UMTS Set", Kind::Array, "NonRankedUMTSSet", {}, {}, {}, false},
        {"ProcessCS", "Process CS", Kind::Dictionary, "ProcessCS", {{0x7131, 16}, {0x7132, 16}},
         {"MM State", "MM Sub State", "LU Reject Cause", "MM Service State"}},
        {"UMTSRRInfo", "UMTS RR Info", Kind::Dictionary, "UMTSRRInfo",
         {{0x4125, 14}, {0x4031, 16}, {0x4127, 29}, {0x4157, 19}, {0xFF0001}},
         {"RRC State", "Transmit Power", "Cell ID", "Downlink Frequency", "Uplink Frequency", "URA ID", "Ciphering",
          "UARFCN", "Scrambling Code"}},
        {"BLER", "BLER", Kind::Dictionary, "BLER", {{0x4116, 16}},
         {"Window Size", "Transport Channels"}, {"Transport Channel ID", "CRC Received", "CRC Received in Error"}},
        {"VirtualActiveSet", "Virtual Active Set", Kind::Array, "VirtualActiveSet", {{0x417A, 16}}, {}},
        kSimInfo,
        {"HSDPAInformation", "HSDPA Info", Kind::Dictionary, "HSDPA Info", {{0x4221, 18}},
         {"Version", "Sub Frames", "Carrier Info", "Primary HARQ Process", "Secondary HARQ Process"},
         {"Process ID", "No Rx Bits", "New Tx", "Block Errors"}, false},
    });
    // clang-format on
    return kTechnology;
}

namespace {

class CellMonitorSection : public testing::TestWithParam<const char*> {};

const SectionContract& contractOf(const char* className)
{
    return *std::ranges::find(technology().sections, std::string_view(className), &SectionContract::className);
}

TEST_P(CellMonitorSection, LogsARecordThatHoldsNoArrayOfCells)
{
    for (const auto& broken : {record(0xFF0001, 13), record(0xFF0001, 40),
                               propertyListRecord(0xFF0001, makeDictionary({{"kVoxCell_MCC", 1}}))}) {
        SectionAtWork run(contractOf(GetParam()));
        run.doubles.propertyLists.parsed[describe(broken.propertyList())] = broken.propertyList();
        run.receive(broken);
        EXPECT_EQ(run.doubles.log.errors(), (std::vector<std::string>{"Cell Info Array data could not be constructed",
                                                                      "Failed to get Cell Array\n"}));
        EXPECT_TRUE(contractOf(GetParam()).isList() ? run.text() == "[]" : run.isUntouched()) << run.text();
    }
}

TEST_P(CellMonitorSection, LogsNothingForAnArrayWithoutCells)
{
    SectionAtWork run(contractOf(GetParam()));
    const auto empty = cellMonitor({});
    run.doubles.propertyLists.parsed[describe(empty.propertyList())] = empty.propertyList();
    run.receive(empty);
    EXPECT_TRUE(run.doubles.log.errors().empty());
    EXPECT_TRUE(contractOf(GetParam()).isList() ? run.text() == "[]" : run.isUntouched()) << run.text();
}

INSTANTIATE_TEST_SUITE_P(GsmAndUmts, CellMonitorSection,
                         testing::Values("GSMServingCell", "NeighboringCells", "ServingPLMN", "UMTSSet", "UMTSRRInfo"),
                         [](const auto& each) { return std::string(each.param); });

} // namespace
} // namespace kestrum
