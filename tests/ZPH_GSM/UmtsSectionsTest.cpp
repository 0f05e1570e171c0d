#include "LogGenerator/ZPH_GSM/BLER.h"
#include "LogGenerator/ZPH_GSM/HSDPAInformation.h"
#include "LogGenerator/ZPH_GSM/SimInfo.h"
#include "LogGenerator/ZPH_GSM/UMTSRRInfo.h"
#include "sections/DecodedSection.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

using Lines = std::vector<std::string>;

TEST(UMTSRRInfo, ShowsTheRrcState)
{
    EXPECT_EQ(decoded<UMTSRRInfo>(record(0x4125, 14).u8(13, 3)).at("RRC State"), "CELL_DCH");
    EXPECT_EQ(decoded<UMTSRRInfo>(record(0x4125, 14).u8(13, 9)).at("RRC State"), "Unknown");
}

RecordBuilder servingCell()
{
    return record(0x4127, 29).u32(13, 9613).u32(17, 10563).u32(21, 0xFFFFFFFE).u16(25, 65535);
}

const Value kMonitored =
    cell("UMTS", "Serving", {{"kVoxCell_CellId", 4711}, {"kVoxCell_UARFCN", 10700}, {"kVoxCell_ScramblingCode", 320}});

TEST(UMTSRRInfo, ShowsItsServingCellInOrder)
{
    EXPECT_EQ(decoded<UMTSRRInfo>(servingCell()).text(),
              R"({"Cell ID": "-2", "Downlink Frequency": "10563", "Uplink Frequency": "9613", "URA ID": "65535"})");
}

TEST(UMTSRRInfo, ForgetsTheMonitoredFrequencyUntilTheNextCellMonitor)
{
    auto section = decoded<UMTSRRInfo>(cellMonitor({kMonitored}));
    EXPECT_EQ(section.at("UARFCN"), "10700");
    EXPECT_FALSE(section.receive(servingCell()).contains("UARFCN"));
    EXPECT_EQ(section.at("Scrambling Code"), "320");
    EXPECT_EQ(section.receive(cellMonitor({kMonitored})).at("UARFCN"), "10700");
}

TEST(UMTSRRInfo, KeepsTheMonitoredFrequencyAfterAShortRecord)
{
    auto section = decoded<UMTSRRInfo>(cellMonitor({kMonitored}));
    EXPECT_EQ(section.receive(record(0x4127, 28)).at("UARFCN"), "10700");
}

RecordBuilder powers(const std::vector<int>& agcs)
{
    auto built = record(0x4031, 16 + 14 * agcs.size()).fill(16, 0x5A);
    built.u8(14, static_cast<unsigned>(agcs.size()));
    for (std::size_t i = 0; i < agcs.size(); ++i)
        built.u16(16 + 14 * i + 4, agcs[i]);
    return built;
}

struct Power {
    const char* name;
    std::vector<int> agcs;
    const char* text;

    friend void PrintTo(const Power& shown, std::ostream* out) { *out << shown.name; }
};

class TransmitPower : public testing::TestWithParam<Power> {};

TEST_P(TransmitPower, IsTheMeanOfWhatHasAValue)
{
    EXPECT_EQ(decoded<UMTSRRInfo>(powers(GetParam().agcs)).at("Transmit Power"), GetParam().text);
}

INSTANTIATE_TEST_SUITE_P(
    UMTSRRInfo, TransmitPower,
    testing::Values(Power{"ZeroMeansNoValue", {100, 0}, "-9.00 dBm"}, Power{"OfTwo", {100, 110}, "-8.50 dBm"},
                    Power{"OfThree", {100, 110, 110}, "-8.33 dBm"}, Power{"TruncatedTowardZero", {-521}, "-70.00 dBm"},
                    Power{"Lowest", {-32768}, "-3295.00 dBm"}, Power{"Highest", {32767}, "3257.00 dBm"},
                    Power{"NotANumberWithoutEntries", {}, " nan dBm"},
                    Power{"NotANumberWithoutValues", {0, 0}, " nan dBm"}),
    [](const auto& each) { return std::string(each.param.name); });

TEST(UMTSRRInfo, TakesTheMeanOfTheEntriesThatTheRecordHolds)
{
    EXPECT_EQ(decoded<UMTSRRInfo>(powers({100, 110}).u8(14, 255)).at("Transmit Power"), "-8.50 dBm");
    EXPECT_EQ(decoded<UMTSRRInfo>(powers({100, 110}).length(16 + 27)).at("Transmit Power"), "-9.00 dBm");
}

TEST(UMTSRRInfo, OfTheCellMonitorTakesTheFirstServingUmtsCell)
{
    EXPECT_EQ(decoded<UMTSRRInfo>(cellMonitor({cell("GSM", "Serving", {{"kVoxCell_CellId", 1}}),
                                               cell("UMTS", "Neighbor", {{"kVoxCell_CellId", 2}}), kMonitored,
                                               cell("UMTS", "Serving", {{"kVoxCell_CellId", 3}})}))
                  .text(),
              R"({"Cell ID": "4711", "UARFCN": "10700", "Scrambling Code": "320"})");
}

TEST(UMTSRRInfo, LogsWhatTheServingCellLacks)
{
    const auto section = decoded<UMTSRRInfo>(cellMonitor({cell("UMTS", "Serving")}));
    EXPECT_EQ(section.text(), "{}");
    EXPECT_EQ(section.log().errors(),
              (Lines{"UMTSRRInfo: Failed to retrieve Cell ID\n", "UMTSRRInfo: Failed to retrieve UARFCN\n",
                     "UMTSRRInfo: Failed to retrieve Scrambling Code\n"}));
}

TEST(BLER, ShowsItsChannels)
{
    EXPECT_EQ(decoded<BLER>(record(0x4116, 34)
                                .u8(13, 2)
                                .u16(14, 65535)
                                .u8(16, 255)
                                .u32(17, 100000)
                                .u32(21, 0xFFFFFFFF)
                                .u8(25, 1)
                                .u32(26, 2)
                                .u32(30, 3))
                  .text(),
              R"({"Window Size": "65535", "Transport Channels": [)"
              R"({"Transport Channel ID": "255", "CRC Received": "100000", "CRC Received in Error": "-1"}, )"
              R"({"Transport Channel ID": "1", "CRC Received": "2", "CRC Received in Error": "3"}]})");
}

TEST(BLER, WithoutChannelsShowsAnEmptyList)
{
    EXPECT_EQ(decoded<BLER>(record(0x4116, 25).u8(13, 1), record(0x4116, 16).u16(14, 50)).text(),
              R"({"Window Size": "50", "Transport Channels": []})");
}

TEST(BLER, StopsAtTheFirstChannelThatTheRecordDoesNotHold)
{
    EXPECT_EQ(decoded<BLER>(record(0x4116, 33).u8(13, 255)).at("Transport Channels").array()->size(), 1u);
    EXPECT_EQ(decoded<BLER>(record(0x4116, 34).u8(13, 255)).at("Transport Channels").array()->size(), 2u);
}

TEST(HSDPAInformation, ShowsTenBitsOfSubFramesAndTheCarrier)
{
    EXPECT_EQ(decoded<HSDPAInformation>(record(0x4221, 18).bytes(13, {2, 200, 0x0B})).text(),
              R"({"Version": "2", "Sub Frames": "968", "Carrier Info": "Dual Carrier"})");
}

TEST(HSDPAInformation, ReadsTheSecondaryProcessesFromOffset180WithOnePrimary)
{
    const auto section = decoded<HSDPAInformation>(record(0x4221, 189)
                                                       .bytes(16, {1, 1})
                                                       .u8(18, 5)
                                                       .u32(19, 0xFFFFFFFF)
                                                       .u16(23, 65535)
                                                       .u16(25, 7)
                                                       .u8(180, 6)
                                                       .u32(181, 1000)
                                                       .u16(185, 8)
                                                       .u16(187, 9));
    EXPECT_EQ(describe(section.at("Primary HARQ Process")),
              R"([{"Process ID": "5", "No Rx Bits": "4294967295", "New Tx": "65535", "Block Errors": "7"}])");
    EXPECT_EQ(describe(section.at("Secondary HARQ Process")),
              R"([{"Process ID": "6", "No Rx Bits": "1000", "New Tx": "8", "Block Errors": "9"}])");
}

TEST(HSDPAInformation, ReadsTheSecondaryProcessesFirstWithoutPrimaryOnes)
{
    const auto section = decoded<HSDPAInformation>(record(0x4221, 36).bytes(16, {0, 2}).u8(18, 3).u8(27, 4));
    EXPECT_FALSE(section.contains("Primary HARQ Process"));
    ASSERT_EQ(section.at("Secondary HARQ Process").array()->size(), 2u);
    EXPECT_EQ((*section.at("Secondary HARQ Process").array())[1].dictionary()->at("Process ID"), "4");
}

TEST(HSDPAInformation, KeepsTheListsThatARecordDoesNotCount)
{
    const auto section = decoded<HSDPAInformation>(record(0x4221, 189).bytes(16, {1, 1}), record(0x4221, 18));
    EXPECT_EQ(section.at("Primary HARQ Process").array()->size(), 1u);
    EXPECT_EQ(section.at("Secondary HARQ Process").array()->size(), 1u);
}

TEST(HSDPAInformation, StopsAtTheFirstProcessThatTheRecordDoesNotHold)
{
    const auto section = decoded<HSDPAInformation>(record(0x4221, 18 + 17).bytes(16, {255, 255}));
    EXPECT_EQ(section.at("Primary HARQ Process").array()->size(), 1u);
    EXPECT_EQ(describe(section.at("Secondary HARQ Process")), "[]");
}

RecordBuilder sim(Value files)
{
    return propertyListRecord(0xFF0000, std::move(files));
}

TEST(SimInfo, ShowsEveryFileUnderItsNameInOrder)
{
    EXPECT_EQ(decoded<SimInfo>(sim(makeDictionary({
                                   {"kSimFile_OPLMNAcT", 14},
                                   {"kSimFile_OPL", 13},
                                   {"kSimFile_PNN", 12},
                                   {"kSimFile_RATMODE", 11},
                                   {"kSimFile_AHPLMN", 10},
                                   {"kSimFile_FPLMN", 9},
                                   {"kSimFile_AD", 8},
                                   {"kSimFile_ACC", 7},
                                   {"kSimFile_PSLOCI", 6},
                                   {"kSimFile_LOCI", 5},
                                   {"kSimFile_HPPLMN", 4},
                                   {"kSimFile_MBDN", 3},
                                   {"kSimFile_MSISDN", 2},
                                   {"kSimFile_ICCID", 1},
                                   {"kSimFile_IMSI", "not shown"},
                               })))
                  .text(),
              R"({"EF-ICCID": 1, "EF-MSISDN": 2, "EF-3GPP MAIL BOX DIALING NUMBER": 3, )"
              R"("EF-HPPLMN SEARCH PERIOD": 4, "EF-LOCI": 5, "EF-GPRS/PS-LOCI": 6, "EF-ACCESS CONTROL CLASS": 7, )"
              R"("EF-ADMINISTRATIVE DATA": 8, "EF-FPLMN": 9, "EF-ACTING HPLMN": 10, "EF-RAT MODE": 11, )"
              R"("EF-PLMN NETWORK NAME": 12, "EF-OPERATOR PLMN LIST": 13, "EF-OPLMNAcT": 14})");
}

TEST(SimInfo, SetsOnlyTheFilesThatCame)
{
    auto section = decoded<SimInfo>(sim(makeDictionary({{"kSimFile_ICCID", "8949"}})));
    EXPECT_EQ(section.text(), R"({"EF-ICCID": "8949"})");
    section.receive(sim(makeDictionary({{"kSimFile_ACC", "0004"}})));
    EXPECT_EQ(section.text(), R"({"EF-ICCID": "8949", "EF-ACCESS CONTROL CLASS": "0004"})");
}

TEST(SimInfo, ShowsValuesWhateverTheirType)
{
    const Value list = makeArray({makeDictionary({{"PLMN", "26202"}}), true, 2.5});
    EXPECT_EQ(decoded<SimInfo>(sim(makeDictionary({{"kSimFile_FPLMN", list}}))).at("EF-FPLMN"), list);
}

struct BrokenSim {
    const char* name;
    RecordBuilder record;

    friend void PrintTo(const BrokenSim& shown, std::ostream* out) { *out << shown.name; }
};

class BrokenSimRecord : public testing::TestWithParam<BrokenSim> {};

TEST_P(BrokenSimRecord, IsLoggedAndThrown)
{
    auto section = decoded<SimInfo>(sim(makeDictionary({{"kSimFile_ICCID", "8949"}})));
    EXPECT_THROW(section.receive(GetParam().record), LogCode_0xFF0000::UnknownDataException);
    EXPECT_EQ(section.log().errors(), Lines{"SIM File dictionary data could not be constructed"});
    EXPECT_EQ(section.text(), R"({"EF-ICCID": "8949"})");
}

INSTANTIATE_TEST_SUITE_P(SimInfo, BrokenSimRecord,
                         testing::Values(BrokenSim{"NoPropertyList", record(0xFF0000, 40)},
                                         BrokenSim{"Nothing", record(0xFF0000, 13)},
                                         BrokenSim{"HeaderCutOff", record(0xFF0000, 13).length(11)},
                                         BrokenSim{"AnArray", propertyListRecord(0xFF0000, makeArray())},
                                         BrokenSim{"AText", propertyListRecord(0xFF0000, "kSimFile_ICCID")}),
                         [](const auto& each) { return std::string(each.param.name); });

TEST(SimInfo, SaysWhatItThrows)
{
    const std::exception& thrown = LogCode_0xFF0000::UnknownDataException();
    EXPECT_STREQ(thrown.what(), "LogCode_0xFF0000::UnknownDataException");
}

} // namespace
} // namespace kestrum
