#include "LogGenerator/ZPH_GSM/GPRSInformation.h"
#include "LogGenerator/ZPH_GSM/GSMRRInfo.h"
#include "LogGenerator/ZPH_GSM/GSMServingCell.h"
#include "LogGenerator/ZPH_GSM/MobileAllocation.h"
#include "LogGenerator/ZPH_GSM/NeighboringCells.h"
#include "sections/DecodedSection.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

using Lines = std::vector<std::string>;

TEST(GSMServingCell, ShowsTheLevelAsItIs)
{
    EXPECT_EQ(decoded<GSMServingCell>(record(0x5137, 29).u8(15, 40)).at("RSSI"), "40 dBm");
    EXPECT_EQ(decoded<GSMServingCell>(record(0x5137, 29).u8(15, 255)).at("RSSI"), "255 dBm");
}

TEST(GSMServingCell, ShowsOfC1AndC2TheLowHalf)
{
    const auto section = decoded<GSMServingCell>(record(0x5137, 29).u32(16, 0x00012345).u32(20, 0xFFFFFFFF));
    EXPECT_EQ(section.text(), R"({"RSSI": "0 dBm", "C1 Value": "9029", "C2 Value": "65535"})");
}

TEST(GSMServingCell, ShowsOfTheDedicatedAllocationTheLowByte)
{
    EXPECT_EQ(decoded<GSMServingCell>(record(0x5076, 17).u16(13, 0x1234)).text(), R"({"MA Dedicated ARFCN": "52"})");
}

TEST(GSMServingCell, ShowsItsIdentityInOrder)
{
    EXPECT_EQ(decoded<GSMServingCell>(record(0x5134, 26).u16(13, 871).u16(15, 63).u16(17, 65535)).text(),
              R"({"Cell ID": "65535", "ARFCN": "871", "BSIC": "63"})");
}

TEST(GSMServingCell, TakesTheFirstServingGsmCell)
{
    const auto section = decoded<GSMServingCell>(cellMonitor(
        {cell("UMTS", "Serving", {{"kVoxCell_CellId", 1}}), cell("GSM", "Neighbor", {{"kVoxCell_CellId", 2}}),
         cell("GSM", "Serving", {{"kVoxCell_CellId", -3}, {"kVoxCell_ARFCN", 62}}),
         cell("GSM", "Serving", {{"kVoxCell_CellId", 4}, {"kVoxCell_ARFCN", 63}})}));
    EXPECT_EQ(section.text(), R"({"Cell ID": "-3", "ARFCN": "62"})");
    EXPECT_EQ(section.log().errors(), Lines{});
}

TEST(GSMServingCell, LogsTheNumbersThatTheCellLacks)
{
    const auto section =
        decoded<GSMServingCell>(record(0x5134, 26).u16(13, 871), cellMonitor({cell("GSM", "Serving")}));
    EXPECT_EQ(section.log().errors(),
              (Lines{"GSMServingCell: Failed to retrieve Cell ID\n", "GSMServingCell: Failed to retrieve ARFCN\n"}));
    EXPECT_EQ(section.at("ARFCN"), "871");
}

/// Neighbours of a measurement record: number, level, C1.
struct Neighbor {
    unsigned arfcn, level;
    std::int64_t c1;
};

RecordBuilder measurements(const std::vector<Neighbor>& neighbors)
{
    auto built = record(0x5137, 29 + 14 * neighbors.size()).u8(28, static_cast<unsigned>(neighbors.size()));
    for (std::size_t i = 0, at = 29; i < neighbors.size(); ++i, at += 14)
        built.u16(at, neighbors[i].arfcn).u8(at + 2, neighbors[i].level).u32(at + 3, neighbors[i].c1);
    return built;
}

RecordBuilder colourCodes(const std::vector<std::pair<unsigned, unsigned>>& codes)
{
    auto built = record(0x51FF, 15 + 4 * codes.size()).u8(14, static_cast<unsigned>(codes.size()));
    for (std::size_t i = 0, at = 15; i < codes.size(); ++i, at += 4)
        built.u16(at, codes[i].first).u8(at + 2, codes[i].second);
    return built;
}

TEST(NeighboringCells, HaveNoColourCodeBeforeTheFirstList)
{
    EXPECT_EQ(decodedList<NeighboringCells>(measurements({{62, 200, -5}, {65535, 0, 70000}})).text(),
              R"([{"ARFCN": "62", "RSSI": "200", "C1 Value": "-5"}, )"
              R"({"ARFCN": "65535", "RSSI": "0", "C1 Value": "70000"}])");
}

TEST(NeighboringCells, HaveTheColourCodeOfTheirFrequency)
{
    EXPECT_EQ(
        decodedList<NeighboringCells>(colourCodes({{62, 17}, {63, 18}}), measurements({{63, 1, 2}, {64, 3, 4}})).text(),
        R"([{"ARFCN": "63", "RSSI": "1", "C1 Value": "2", "BSIC": "18"}, )"
        R"({"ARFCN": "64", "RSSI": "3", "C1 Value": "4"}])");
}

TEST(NeighboringCells, TakeTheLaterOfTwoColourCodes)
{
    EXPECT_EQ(decodedList<NeighboringCells>(colourCodes({{62, 17}, {62, 255}}), measurements({{62, 1, 2}}))
                  .row(0)
                  ->at("BSIC"),
              "255");
}

TEST(NeighboringCells, ForgetTheColourCodesOfAnEarlierList)
{
    EXPECT_FALSE(decodedList<NeighboringCells>(colourCodes({{62, 17}}), colourCodes({}), measurements({{62, 1, 2}}))
                     .row(0)
                     ->contains("BSIC"));
}

TEST(NeighboringCells, KeepTheColourCodesAfterAShortList)
{
    EXPECT_EQ(decodedList<NeighboringCells>(colourCodes({{62, 17}}), record(0x51FF, 14), measurements({{62, 1, 2}}))
                  .row(0)
                  ->at("BSIC"),
              "17");
}

TEST(NeighboringCells, AreNotTouchedByTheColourCodes)
{
    auto section = decodedList<NeighboringCells>(measurements({{62, 1, 2}}));
    const auto before = section.text();
    EXPECT_EQ(section.receive(colourCodes({{62, 17}})).text(), before);
}

TEST(NeighboringCells, AreNoneWhenTheRecordCountsNone)
{
    EXPECT_EQ(decodedList<NeighboringCells>(measurements({{62, 1, 2}}), measurements({})).text(), "[]");
}

TEST(NeighboringCells, StopAtTheFirstThatTheRecordDoesNotHold)
{
    EXPECT_EQ(decodedList<NeighboringCells>(measurements({{62, 1, 2}, {63, 3, 4}}).u8(28, 255)).size(), 2u);
    EXPECT_EQ(decodedList<NeighboringCells>(measurements({{62, 1, 2}, {63, 3, 4}}).length(29 + 27)).size(), 1u);
    EXPECT_EQ(
        decodedList<NeighboringCells>(colourCodes({{62, 17}, {63, 18}}).length(15 + 7), measurements({{63, 1, 2}}))
            .text(),
        R"([{"ARFCN": "63", "RSSI": "1", "C1 Value": "2"}])");
}

TEST(NeighboringCells, OfTheCellMonitorShowTwiceTheLevel)
{
    EXPECT_EQ(decodedList<NeighboringCells>(
                  cellMonitor({cell("GSM", "Neighbor", {{"kVoxCell_ARFCN", 62}, {"kVoxCell_RSSI", -40}})}))
                  .text(),
              R"([{"ARFCN": "62", "RSSI": "-80 dBm"}])");
}

TEST(NeighboringCells, OfTheCellMonitorShowNoLevelWhenItWasNotMeasured)
{
    EXPECT_EQ(decodedList<NeighboringCells>(
                  cellMonitor({cell("GSM", "Neighbor", {{"kVoxCell_ARFCN", 62}, {"kVoxCell_RSSI", 32767}})}))
                  .row(0)
                  ->at("RSSI"),
              "");
}

TEST(NeighboringCells, OfTheCellMonitorTakeTheLevelAs16Bits)
{
    EXPECT_EQ(decodedList<NeighboringCells>(
                  cellMonitor({cell("GSM", "Neighbor", {{"kVoxCell_ARFCN", 1}, {"kVoxCell_RSSI", 65536 - 40}}),
                               cell("GSM", "Neighbor", {{"kVoxCell_ARFCN", 2}, {"kVoxCell_RSSI", -32768}})}))
                  .text(),
              R"([{"ARFCN": "1", "RSSI": "-80 dBm"}, {"ARFCN": "2", "RSSI": "-65536 dBm"}])");
}

TEST(NeighboringCells, OfTheCellMonitorAreTheGsmNeighboursInOrder)
{
    EXPECT_EQ(decodedList<NeighboringCells>(
                  cellMonitor({cell("GSM", "Serving", {{"kVoxCell_ARFCN", 1}}),
                               cell("GSM", "Neighbor", {{"kVoxCell_ARFCN", 9}, {"kVoxCell_RSSI", -1}}),
                               cell("UMTS", "Neighbor", {{"kVoxCell_ARFCN", 2}}), "no cell",
                               cell("GSM", "Neighbor", {{"kVoxCell_ARFCN", 3}, {"kVoxCell_RSSI", 0}})}))
                  .text(),
              R"([{"ARFCN": "9", "RSSI": "-2 dBm"}, {"ARFCN": "3", "RSSI": "0 dBm"}])");
}

TEST(NeighboringCells, OfTheCellMonitorStayWithoutWhatTheyLack)
{
    const auto section = decodedList<NeighboringCells>(cellMonitor({cell("GSM", "Neighbor")}));
    EXPECT_EQ(section.text(), "[{}]");
    EXPECT_EQ(section.log().errors(),
              (Lines{"NeighboringCells: Failed to retrieve ARFCN\n", "NeighboringCells: Failed to retrieve RSSI\n"}));
}

TEST(NeighboringCells, OfABrokenCellMonitorRecordAreNone)
{
    auto section = decodedList<NeighboringCells>(measurements({{62, 1, 2}}));
    section.receive(record(0xFF0001, 40));
    EXPECT_EQ(section.text(), "[]");
    EXPECT_EQ(section.log().errors(),
              (Lines{"Cell Info Array data could not be constructed", "Failed to get Cell Array\n"}));
}

TEST(GPRSInformation, ShowsAnUnknownT3192)
{
    EXPECT_EQ(decoded<GPRSInformation>(record(0x51F6, 24).u8(15, 9)).at("T3192"), "?? ms");
}

TEST(GPRSInformation, ShowsWhatWasNotSent)
{
    EXPECT_EQ(decoded<GPRSInformation>(record(0x51F5, 18).bytes(13, {255, 255, 255})).text(),
              R"({"Network Control Order": "Not Available", "PFC Supported": "Available", )"
              R"("Priority Access Threshold": "Not Available"})");
}

TEST(GPRSInformation, SetsItsKeysInOrder)
{
    EXPECT_EQ(decoded<GPRSInformation>(record(0x51F6, 24).bytes(15, {4, 255, 1})).text(),
              R"({"T3192": "80 ms", "Access Burst Type": "11-bit format", "DRX Timer Max": "255"})");
    EXPECT_EQ(decoded<GPRSInformation>(record(0x51FD, 35).bytes(13, {1, 2, 3, 4}).u8(33, 5)).text(),
              R"({"Ext Measurement Order": "4", "Packet PSI Status": "1", "Packet SI Status": "Supported", )"
              R"("Count LR": "2", "Count HR": "3"})");
    EXPECT_EQ(decoded<GPRSInformation>(record(0x51FB, 34).u8(13, 200)).text(), R"({"PBCCH Present": "200"})");
}

class CodesAmongGprsInformation : public testing::TestWithParam<LogCode> {};

TEST_P(CodesAmongGprsInformation, AreUnknown)
{
    const auto section = decoded<GPRSInformation>(record(GetParam(), 64));
    EXPECT_EQ(section.log().errors(), Lines{"Received an unknown log message: " + std::to_string(GetParam())});
    EXPECT_EQ(section.text(), "{}");
}

INSTANTIATE_TEST_SUITE_P(GPRSInformation, CodesAmongGprsInformation,
                         testing::Values(20983u, 20984u, 20985u, 20986u, 20988u)); // 0x51F7 to 0x51FA, 0x51FC

TEST(GSMRRInfo, ShowsTheLevelOfTheSameByteAsTheServingCell)
{
    EXPECT_EQ(decoded<GSMRRInfo>(record(0x5137, 29).u8(15, 40)).at("Serving Rx Level"), "40");
}

TEST(GSMRRInfo, ShowsQualityAsWholeSignedWords)
{
    EXPECT_EQ(decoded<GSMRRInfo>(record(0x5137, 29).u32(16, 0x00012345).u32(20, 0xFFFFFFFF)).text(),
              R"({"Serving Rx Level": "0", "Rx Quality Full": "74565", "Rx Quality Sub": "-1"})");
}

TEST(GSMRRInfo, ShowsStateSubstateStatusAndModeInOrder)
{
    EXPECT_EQ(decoded<GSMRRInfo>(record(0x512C, 17).bytes(13, {13, 200, 3, 1})).text(),
              R"({"RR State": "RR_W2G_INTERRAT_HANDOVER_ PROGRESS", "RR Sub State": "200", "RR Status": "3", )"
              R"("RR Mode": "Data"})");
}

TEST(GSMRRInfo, ShowsTheDrxTimerInSeconds)
{
    EXPECT_EQ(decoded<GSMRRInfo>(record(0x51F6, 24).u8(16, 255)).text(), R"({"DRX Used": "255 sec"})");
}

RecordBuilder allocation(unsigned hsn, const std::vector<unsigned>& arfcns)
{
    auto built = record(0x51F8, 15 + 2 * arfcns.size()).u8(13, hsn).u8(14, static_cast<unsigned>(arfcns.size()));
    for (std::size_t i = 0; i < arfcns.size(); ++i)
        built.u16(15 + 2 * i, arfcns[i]);
    return built;
}

TEST(MobileAllocation, ShowsItsFrequenciesInOrder)
{
    EXPECT_EQ(decoded<MobileAllocation>(allocation(63, {975, 1, 65535})).text(),
              R"({"HSN": "63", "ARFCNs": ["975", "1", "65535"]})");
}

TEST(MobileAllocation, WithoutFrequenciesShowsAnEmptyList)
{
    EXPECT_EQ(decoded<MobileAllocation>(allocation(1, {975}), allocation(5, {})).text(),
              R"({"HSN": "5", "ARFCNs": []})");
}

TEST(MobileAllocation, StopsAtTheFirstFrequencyThatTheRecordDoesNotHold)
{
    EXPECT_EQ(decoded<MobileAllocation>(allocation(5, {975, 976}).u8(14, 255)).text(),
              R"({"HSN": "5", "ARFCNs": ["975", "976"]})");
    EXPECT_EQ(decoded<MobileAllocation>(allocation(5, {975, 976}).length(18)).text(),
              R"({"HSN": "5", "ARFCNs": ["975"]})");
}

} // namespace
} // namespace kestrum
