#include "LogGenerator/LTE/ServingCellMeasurement.h"

#include "sections/DecodedSection.h"
#include "sections/FieldCase.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace kestrum {
namespace {

using testing::ElementsAre;
using testing::Pair;

TEST(ServingCellMeasurement, HasItsNameAndItsCode)
{
    auto section = decoded<ServingCellMeasurement>();
    EXPECT_EQ(section.section().getSectionName(), "Serving Cell Measurements");
    EXPECT_EQ(section.section().getLogCodeArray(), std::vector<LogCode>{0xB17F});
}

TEST(ServingCellMeasurement, ShowsItsKeysInOrder)
{
    const auto display = decoded<ServingCellMeasurement>(record(0xB17F, 33).u8(13, 4).u16(17, 6300));
    EXPECT_EQ(display.text(), R"({"Version": "4", "E-ARFCN": "6300", "Physical Cell ID": "0", )"
                              R"("Serving Layer Priority": "0", "Measured RSRP": "-140.00 dBm", )"
                              R"("Average RSRP": "-140.00 dBm", "Measured RSRQ": "-30.00 dB", )"
                              R"("Average RSRQ": "-30.00 dB", "Measured RSSI": "-140.00 dBm", )"
                              R"("Qrxlevmin": "-140 dBm", "P_Max": "-30 dBm", "Max UE Tx Power": "-30 dBm", )"
                              R"("Srxlev": "-30 dBm", "Num of Consecutive DRX Cycles of S < 0": "0", )"
                              R"("S Intra Search": "0 dB", "S Non Intra Search": "0 dBm", )"
                              R"("Measurement Rules Updated": "False", "Measurement Rules": "0"})");
    EXPECT_THAT(display.log().lines, ElementsAre(Pair(Priority::Warning, "Serving Cell Measurements")));
}

TEST(ServingCellMeasurement, Of32BytesChangesNothing)
{
    auto display = decoded<ServingCellMeasurement>(record(0xB17F, 33).u16(17, 6300));
    const auto before = display.text();
    display.receive(record(0xB17F, 32).fill(13, 0xFF));
    EXPECT_EQ(display.text(), before);
}

TEST(ServingCellMeasurement, ReportsAForeignCode)
{
    const auto display = DecodedSection<ServingCellMeasurement>(makeDictionary()).receive(record(0xB179, 40)).text();
    EXPECT_EQ(display, "{}");
    auto section = decoded<ServingCellMeasurement>(record(0xB179, 40));
    EXPECT_THAT(section.log().lines, ElementsAre(Pair(Priority::Warning, "Serving Cell Measurements"),
                                                 Pair(Priority::Error, "Received an unknown log message: 45433")));
}

class ServingCellField : public testing::TestWithParam<FieldCase> {};

TEST_P(ServingCellField, IsShownIndependentlyOfOtherFields)
{
    for (const bool amidOnes : {false, true}) {
        const auto display = decoded<ServingCellMeasurement>(GetParam().in(record(0xB17F, 33), amidOnes));
        EXPECT_EQ(display.at(GetParam().key), GetParam().text) << "amid " << (amidOnes ? "ones" : "zeros");
    }
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(ServingCellMeasurement, ServingCellField, testing::Values(
    // name                    at w  bits    raw     key                     text
    FieldCase{"Version",         13, 1, 0, 7,   255,    "Version",                "255"},
    FieldCase{"Earfcn",          17, 2, 0, 15,  65535,  "E-ARFCN",                "65535"},
    FieldCase{"CellIdLowest",    19, 2, 0, 8,   0,      "Physical Cell ID",       "0"},
    FieldCase{"CellIdHighest",   19, 2, 0, 8,   503,    "Physical Cell ID",       "503"},
    FieldCase{"CellIdAllBits",   19, 2, 0, 8,   511,    "Physical Cell ID",       "511"},
    FieldCase{"PriorityLowest",  19, 2, 9, 12,  0,      "Serving Layer Priority", "0"},
    FieldCase{"PriorityHighest", 19, 2, 9, 12,  15,     "Serving Layer Priority", "15"},
    FieldCase{"RsrpLowest",      21, 4, 0, 8,   0,      "Measured RSRP",          "-140.00 dBm"},
    FieldCase{"RsrpQuarterDb",   21, 4, 0, 8,   201,    "Measured RSRP",          "-89.75 dBm"},
    FieldCase{"RsrpHighest",     21, 4, 0, 8,   511,    "Measured RSRP",          "-12.25 dBm"},
    FieldCase{"AverageRsrp",     21, 4, 9, 17,  400,    "Average RSRP",           "-40.00 dBm"},
    FieldCase{"RsrqLowest",      21, 4, 18, 24, 0,      "Measured RSRQ",          "-30.00 dB"},
    FieldCase{"RsrqHighest",     21, 4, 18, 24, 127,    "Measured RSRQ",          "1.75 dB"},
    FieldCase{"AverageRsrq",     21, 4, 25, 31, 73,     "Average RSRQ",           "-11.75 dB"},
    FieldCase{"RssiLowest",      25, 4, 0, 8,   0,      "Measured RSSI",          "-140.00 dBm"},
    FieldCase{"RssiHalfDb",      25, 4, 0, 8,   141,    "Measured RSSI",          "-69.50 dBm"},
    FieldCase{"RssiHighest",     25, 4, 0, 8,   511,    "Measured RSSI",          "115.50 dBm"},
    FieldCase{"QrxlevminLowest", 25, 4, 9, 14,  0,      "Qrxlevmin",              "-140 dBm"},
    FieldCase{"QrxlevminRaw33",  25, 4, 9, 14,  33,     "Qrxlevmin",              "-74 dBm"},
    FieldCase{"QrxlevminTop",    25, 4, 9, 14,  63,     "Qrxlevmin",              "-14 dBm"},
    FieldCase{"PMaxLowest",      25, 4, 15, 21, 0,      "P_Max",                  "-30 dBm"},
    FieldCase{"PMaxOfAHandset",  25, 4, 15, 21, 53,     "P_Max",                  "23 dBm"},
    FieldCase{"PMaxBelowMarker", 25, 4, 15, 21, 63,     "P_Max",                  "33 dBm"},
    FieldCase{"PMaxAbsent",      25, 4, 15, 21, 64,     "P_Max",                  "Not Present"},
    FieldCase{"PMaxAboveMarker", 25, 4, 15, 21, 65,     "P_Max",                  "35 dBm"},
    FieldCase{"PMaxHighest",     25, 4, 15, 21, 127,    "P_Max",                  "97 dBm"},
    FieldCase{"TxPowerLowest",   25, 4, 22, 27, 0,      "Max UE Tx Power",        "-30 dBm"},
    FieldCase{"TxPowerHighest",  25, 4, 22, 27, 63,     "Max UE Tx Power",        "33 dBm"},
    FieldCase{"SrxlevLowest",    29, 4, 0, 6,   0,      "Srxlev",                 "-30 dBm"},
    FieldCase{"SrxlevHighest",   29, 4, 0, 6,   127,    "Srxlev",                 "97 dBm"},
    FieldCase{"DrxCycles",       29, 4, 7, 12,  63,     "Num of Consecutive DRX Cycles of S < 0", "63"},
    FieldCase{"IntraRaw31",      29, 4, 13, 18, 31,     "S Intra Search",         "62 dB"},
    FieldCase{"IntraAbsent",     29, 4, 13, 18, 32,     "S Intra Search",         "Not Present"},
    FieldCase{"IntraHighest",    29, 4, 13, 18, 63,     "S Intra Search",         "126 dB"},
    FieldCase{"NonIntraRaw31",   29, 4, 19, 24, 31,     "S Non Intra Search",     "62 dBm"},
    FieldCase{"NonIntraAbsent",  29, 4, 19, 24, 32,     "S Non Intra Search",     "Not Present"},
    FieldCase{"NonIntraHighest", 29, 4, 19, 24, 63,     "S Non Intra Search",     "126 dBm"},
    FieldCase{"RulesUpdated",    29, 4, 25, 25, 1,      "Measurement Rules Updated", "True"},
    FieldCase{"RulesNotUpdated", 29, 4, 25, 25, 0,      "Measurement Rules Updated", "False"},
    FieldCase{"RulesHighest",    29, 4, 26, 29, 15,     "Measurement Rules",      "15"}),
    [](const auto& each) { return std::string(each.param.name); });
// clang-format on

// The marker for absence, 64, needs seven bits. Its highest bit is in no field.
TEST(ServingCellMeasurement, NeverShowsAnAbsentMaxUeTxPower)
{
    for (std::uint32_t raw = 0; raw < 128; ++raw) {
        const auto display = decoded<ServingCellMeasurement>(record(0xB17F, 33).u32(25, raw << 22));
        EXPECT_NE(display.at("Max UE Tx Power"), "Not Present") << raw;
    }
}

} // namespace
} // namespace kestrum
