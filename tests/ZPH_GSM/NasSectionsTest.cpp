#include "LogGenerator/ZPH_GSM/EquivalentPLMNList.h"
#include "LogGenerator/ZPH_GSM/PDPContextList.h"
#include "LogGenerator/ZPH_GSM/ProcessCO.h"
#include "LogGenerator/ZPH_GSM/ProcessCS.h"
#include "LogGenerator/ZPH_GSM/ProcessPS.h"
#include "LogGenerator/ZPH_GSM/ServingPLMN.h"
#include "sections/DecodedSection.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

using Lines = std::vector<std::string>;

RecordBuilder servingPlmn()
{
    return record(0x7135, 32).bytes(15, {0x13, 0x00, 0x62});
}

TEST(ProcessCS, ShowsStateSubstateAndUpdateStatusInOrder)
{
    EXPECT_EQ(decoded<ProcessCS>(record(0x7131, 16).bytes(13, {19, 8, 0})).text(),
              R"({"MM State": "MM_IDLE", "MM Sub State": "MM_NORMAL_SERVICE", "LU Reject Cause": "UPDATED"})");
}

TEST(ProcessCS, KeepsTheBlankInsideAStatesName)
{
    EXPECT_EQ(decoded<ProcessCS>(record(0x7131, 16).u8(13, 20)).at("MM State"),
              "MM_WAIT_FOR_ADDITIONAL_OUTGOING_MM_ CONNECTION");
}

TEST(ProcessCS, ShowsGapsAndValuesBeyondTheNamesAsUnknown)
{
    EXPECT_EQ(decoded<ProcessCS>(record(0x7131, 16).u8(13, 4)).at("MM State"), "Unknown");
    EXPECT_EQ(decoded<ProcessCS>(record(0x7131, 16).u8(13, 26)).at("MM State"), "Unknown");
}

TEST(ProcessCS, LeavesTheOtherRecordsKeysAsTheyWere)
{
    EXPECT_EQ(decoded<ProcessCS>(record(0x7132, 16).u8(13, 1), record(0x7131, 16).bytes(13, {6, 0, 1})).text(),
              R"({"MM Service State": "REG_STATE_IDLE", "MM State": "MM_CONNECTION_ACTIVE", )"
              R"("MM Sub State": "MM_NULL_SUBSTATE", "LU Reject Cause": "NOT_UPDATED"})");
}

TEST(ProcessCO, ShowsOfMobilityManagementTheStateAlone)
{
    const auto section = decoded<ProcessCO>(record(0x7131, 16).bytes(13, {19, 8, 0}));
    EXPECT_EQ(section.text(), R"({"MM State": "MM_IDLE"})");
    EXPECT_EQ(section.log().count("ProcessCS"), 1u); // Kept: field logs show this word
}

TEST(ProcessPS, ShowsTheMisspeltSubstate)
{
    EXPECT_EQ(decoded<ProcessPS>(record(0x7130, 16).u8(14, 9)).at("MM Sub State"), "GMM_ATTEMPING_TO_UPDATE");
}

TEST(ProcessPS, ShowsTheGmmStateUnderTheMmKeysInOrder)
{
    EXPECT_EQ(decoded<ProcessPS>(record(0x7130, 16).bytes(13, {3, 0, 2})).text(),
              R"({"MM State": "GMM_REGISTERED", "MM Sub State": "GMM_NORMAL_SERVICE", )"
              R"("Attach Reject Cause": "GMM_GU3_PLMN_NOT_ALLOWED"})");
}

TEST(ServingPLMN, ShowsAThreeDigitNetworkCode)
{
    const auto section = decoded<ServingPLMN>(servingPlmn());
    EXPECT_EQ(section.at("Mobile Country Code"), "310");
    EXPECT_EQ(section.at("Mobile Network Code"), "260");
}

TEST(ServingPLMN, ShowsATwoDigitNetworkCodeWithATrailingBlank)
{
    const auto section = decoded<ServingPLMN>(servingPlmn().u8(16, 0xF0));
    EXPECT_EQ(section.at("Mobile Country Code"), "310");
    EXPECT_EQ(section.at("Mobile Network Code"), "26 ");
}

struct Digits {
    const char* name;
    unsigned byte15, byte16, byte17;
    const char *country, *network;

    friend void PrintTo(const Digits& shown, std::ostream* out) { *out << shown.name; }
};

class PlmnDigits : public testing::TestWithParam<Digits> {};

TEST_P(PlmnDigits, AreTakenFromTheirHalfBytes)
{
    const auto& [name, byte15, byte16, byte17, country, network] = GetParam();
    const auto section = decoded<ServingPLMN>(record(0x7135, 32).bytes(15, {byte15, byte16, byte17}));
    EXPECT_EQ(section.at("Mobile Country Code"), country);
    EXPECT_EQ(section.at("Mobile Network Code"), network);
}

INSTANTIATE_TEST_SUITE_P(ServingPLMN, PlmnDigits,
                         testing::Values(Digits{"EachItsOwn", 0x21, 0x63, 0x54, "123", "456"},
                                         Digits{"Nines", 0x99, 0x99, 0x99, "999", "999"},
                                         Digits{"NothingButFiller", 0xFF, 0xFF, 0xFF, "   ", "   "},
                                         Digits{"FirstBeyondADigit", 0xAA, 0xAA, 0xAA, "   ", "   "},
                                         Digits{"HighHalvesMissing", 0xF1, 0xF2, 0xF3, "1 2", "3  "},
                                         Digits{"LowHalvesMissing", 0x1F, 0x2F, 0x3F, " 1 ", " 32"}),
                         [](const auto& each) { return std::string(each.param.name); });

TEST(ServingPLMN, ReadsTheLocationAreaHighByteFirst)
{
    EXPECT_EQ(decoded<ServingPLMN>(servingPlmn().bytes(18, {0x12, 0x34})).at("Location Area Code"), "4660");
}

TEST(ServingPLMN, SetsItsKeysInOrder)
{
    EXPECT_EQ(decoded<ServingPLMN>(servingPlmn().u8(14, 3).bytes(18, {0xFF, 0xFE, 0xFF})).text(),
              R"({"Mobile Country Code": "310", "Mobile Network Code": "260", "Location Area Code": "65534", )"
              R"("Routing Area Code": "255", "Service Type": "CS_PS_SERVICE"})");
}

const Value kGsmServing = cell("GSM", "Serving", {{"kVoxCell_MCC", 262}, {"kVoxCell_MNC", 2}, {"kVoxCell_LAC", 5000}});
const Value kUmtsServing = cell("UMTS", "Serving", {{"kVoxCell_MCC", 208}, {"kVoxCell_MNC", 10}, {"kVoxCell_LAC", 77}});

TEST(ServingPLMN, TakesTheFirstServingCellOfGsmOrUmts)
{
    EXPECT_EQ(
        decoded<ServingPLMN>(cellMonitor({cell("GSM", "Neighbor", {{"kVoxCell_MCC", 1}}), kUmtsServing, kGsmServing}))
            .text(),
        R"({"Mobile Country Code": "208", "Mobile Network Code": "10", "Location Area Code": "77"})");
    EXPECT_EQ(decoded<ServingPLMN>(cellMonitor({kGsmServing, kUmtsServing})).at("Mobile Country Code"), "262");
}

TEST(ServingPLMN, IsNotChangedByALteServingCell)
{
    auto section = decoded<ServingPLMN>(servingPlmn());
    const auto before = section.text();
    section.receive(cellMonitor({cell("LTE", "Serving", {{"kVoxCell_MCC", 1}, {"kVoxCell_MNC", 1}})}));
    EXPECT_EQ(section.text(), before);
    EXPECT_EQ(section.log().errors(), Lines{});
}

TEST(ServingPLMN, LogsAMissingNetworkCodeAndSetsTheRest)
{
    const auto section =
        decoded<ServingPLMN>(cellMonitor({cell("GSM", "Serving", {{"kVoxCell_MCC", 262}, {"kVoxCell_LAC", 5000}})}));
    EXPECT_EQ(section.log().errors(), Lines{"ServingPLMN: Failed to retrieve MNC\n"});
    EXPECT_EQ(section.text(), R"({"Mobile Country Code": "262", "Location Area Code": "5000"})");
}

TEST(ServingPLMN, LogsEveryMissingNumberInOrder)
{
    EXPECT_EQ(
        decoded<ServingPLMN>(cellMonitor({cell("UMTS", "Serving", {{"kVoxCell_LAC", "no number"}})})).log().errors(),
        (Lines{"ServingPLMN: Failed to retrieve MCC\n", "ServingPLMN: Failed to retrieve MNC\n",
               "ServingPLMN: Failed to retrieve LAC\n"}));
}

TEST(ServingPLMN, ShowsWhicheverCameLast)
{
    auto section = decoded<ServingPLMN>(servingPlmn(), cellMonitor({kGsmServing}));
    EXPECT_EQ(section.at("Mobile Network Code"), "2");
    EXPECT_EQ(section.receive(servingPlmn()).at("Mobile Network Code"), "260");
}

TEST(ServingPLMN, SkipsCellsThatSayNoTechnologyOrNoType)
{
    auto untyped = makeDictionary({{"kVoxCell_Technology", "kVoxCellTechnology_GSM"}, {"kVoxCell_MCC", 1}});
    auto unknown = makeDictionary({{"kVoxCell_Type", "kVoxCellType_Serving"}, {"kVoxCell_MCC", 2}});
    EXPECT_EQ(
        decoded<ServingPLMN>(cellMonitor({untyped, unknown, "no cell", 7, kGsmServing})).at("Mobile Country Code"),
        "262");
}

RecordBuilder equivalentPlmns(unsigned count, std::initializer_list<unsigned> digits)
{
    return record(0x7150, 17 + digits.size()).u8(16, count).bytes(17, digits);
}

TEST(EquivalentPLMNList, ShowsInterleavedDigits)
{
    EXPECT_EQ(decodedList<EquivalentPLMNList>(equivalentPlmns(1, {3, 2, 1, 6, 0, 0})).text(),
              R"([{"Mobile Country Code": "310", "Mobile Network Code": "260"}])");
}

TEST(EquivalentPLMNList, ReadsTheNextNetworkThreeBytesOn)
{
    EXPECT_EQ(decodedList<EquivalentPLMNList>(equivalentPlmns(2, {1, 2, 3, 4, 5, 6, 7, 8, 9})).text(),
              R"([{"Mobile Country Code": "135", "Mobile Network Code": "246"}, )"
              R"({"Mobile Country Code": "468", "Mobile Network Code": "579"}])");
}

TEST(EquivalentPLMNList, ShowsInvalidDigitsAsTheirWeightedSum)
{
    EXPECT_EQ(decodedList<EquivalentPLMNList>(equivalentPlmns(1, {255, 0, 255, 0, 255, 0})).text(),
              R"([{"Mobile Country Code": "28305", "Mobile Network Code": "0"}])");
}

TEST(EquivalentPLMNList, IsEmptyWithoutNetworks)
{
    EXPECT_EQ(decodedList<EquivalentPLMNList>(equivalentPlmns(1, {3, 2, 1, 6, 0, 0}), equivalentPlmns(0, {})).text(),
              "[]");
}

TEST(EquivalentPLMNList, IsLeftUntouchedByARecordOf16Bytes)
{
    auto section = decodedList<EquivalentPLMNList>(equivalentPlmns(1, {3, 2, 1, 6, 0, 0}));
    section.receive(record(0x7150, 16));
    EXPECT_EQ(section.size(), 1u);
}

TEST(EquivalentPLMNList, StopsAtTheFirstNetworkWithoutAllItsDigits)
{
    EXPECT_EQ(decodedList<EquivalentPLMNList>(equivalentPlmns(255, {1, 2, 3, 4, 5, 6, 7, 8})).size(), 1u);
    EXPECT_EQ(decodedList<EquivalentPLMNList>(equivalentPlmns(255, {1, 2, 3, 4, 5, 6, 7, 8, 9})).size(), 2u);
    EXPECT_EQ(decodedList<EquivalentPLMNList>(equivalentPlmns(1, {1, 2, 3, 4, 5})).size(), 0u);
}

Value context(const char* accessPoint)
{
    return makeDictionary({{"APN", accessPoint}, {"Active", true}});
}

TEST(PDPContextList, ShowsTheRowsAsSent)
{
    EXPECT_EQ(
        decodedList<PDPContextList>(propertyListRecord(0xFF0002, makeArray({context("internet"), "text", 3}))).text(),
        R"([{"APN": "internet", "Active": true}, "text", 3])");
}

TEST(PDPContextList, ReplacesTheRowsAndMayBecomeEmpty)
{
    auto section =
        decodedList<PDPContextList>(propertyListRecord(0xFF0002, makeArray({context("internet"), context("ims")})),
                                    propertyListRecord(0xFF0002, makeArray({context("mms")})));
    EXPECT_EQ(section.size(), 1u);
    EXPECT_EQ(section.row(0)->at("APN"), "mms");
    EXPECT_EQ(section.receive(propertyListRecord(0xFF0002, makeArray())).text(), "[]");
}

TEST(PDPContextList, IsLeftAsItWasByADictionary)
{
    auto section = decodedList<PDPContextList>(propertyListRecord(0xFF0002, makeArray({context("internet")})));
    section.receive(propertyListRecord(0xFF0002, makeDictionary({{"APN", "other"}})));
    EXPECT_EQ(section.size(), 1u);
    EXPECT_EQ(section.row(0)->at("APN"), "internet");
}

TEST(PDPContextList, LogsNothingForARecordWithoutAPropertyList)
{
    auto section = decodedList<PDPContextList>(propertyListRecord(0xFF0002, makeArray({context("internet")})));
    section.log().lines.clear();
    section.receive(record(0xFF0002, 40)).receive(record(0xFF0002, 13)).receive(record(0xFF0002, 13).length(11));
    EXPECT_EQ(section.size(), 1u);
    EXPECT_EQ(section.log().errors(), Lines{});
}

TEST(PDPContextList, DoesNotLookAtTheCode)
{
    auto section = decodedList<PDPContextList>();
    section.receive(propertyListRecord(0xFF0002, makeArray({context("internet")})), 0x1234);
    EXPECT_EQ(section.size(), 1u);
    EXPECT_EQ(section.log().errors(), Lines{});
}

} // namespace
} // namespace kestrum
