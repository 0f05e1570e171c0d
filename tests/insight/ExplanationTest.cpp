#include "insight/Explanation.h"

#include "LogGenerator/Quantities.h"
#include "platform/TelephonyService.h"

#include <gtest/gtest.h>

namespace kestrum {
namespace {

constexpr auto kLte = kVoxLogChannelTechnology_Zephra_LTE, kGsm = kVoxLogChannelTechnology_Zephra_GSM,
               kIfx = kVoxLogChannelTechnology_IFX;

double rsrp(std::uint32_t raw)
{
    return raw * 0.25 - 140;
}

Value number(std::uint32_t raw)
{
    return Reading(decimalSigned32, raw);
}

std::string gradeOf(const KeyEntry* entry, const Value& value, const DictionaryRef& beside = nullptr)
{
    const Thresholds thresholds;
    const auto verdict = verdictOf(*entry, value, beside.get(), thresholds);
    return verdict ? std::string(word(verdict->grade)) : "none";
}

TEST(Explanation, OfALevelHasMeaningVerdictAndStandard)
{
    const Thresholds thresholds;
    const auto* entry = keyEntry(kLte, "Serving Cell Measurements", "Measured RSRP");
    const auto explanation = explain(*entry, Reading(inDbm<rsrp>, 192), nullptr, thresholds); // -92.00 dBm
    EXPECT_EQ(explanation.title, "Measured RSRP");
    EXPECT_EQ(linesOf(explanation),
              (std::vector<std::string>{
                  "The mean power of one resource element with a reference signal. It is about 10 log10(12 N) dB below "
                  "the power of N fully loaded resource blocks. This is the last measurement.",
                  "This value: fair, by profile drive-test (Common practice in drive tests; no public standard grades "
                  "levels)",
                  "Standard: 3GPP TS 36.214, 5.1.1; TS 36.133, 9.1.4"}));
}

TEST(Explanation, OfAChannelHasBandAndFrequencies)
{
    const Thresholds thresholds;
    const auto* entry = keyEntry(kLte, "Serving Cell Measurements", "E-ARFCN");
    EXPECT_EQ(linesOf(explain(*entry, number(6300), nullptr, thresholds)),
              (std::vector<std::string>{"The channel number of the downlink.", "Band: 20", "Downlink: 806 MHz",
                                        "Uplink: 847 MHz", "Standard: 3GPP TS 36.101, 5.7.3"}));
    EXPECT_EQ(linesOf(explain(*entry, Value(""), nullptr, thresholds)),
              (std::vector<std::string>{"The channel number of the downlink.", "Standard: 3GPP TS 36.101, 5.7.3"}));
}

TEST(Explanation, WithoutANumberHasNoVerdict)
{
    const auto* power = keyEntry(kLte, "Serving Cell Measurements", "Measured RSRP");
    for (const char* text : {"", "Not Present", "N/A", "nan dBm", " nan dBm", "-92", "-92 dB", "-92 dBm x"})
        EXPECT_EQ(gradeOf(power, Value(text)), "none") << text;
    EXPECT_EQ(gradeOf(power, Value()), "none");
    EXPECT_EQ(gradeOf(power, Value("-92.00 dBm")), "fair"); // of a snapshot
    EXPECT_EQ(gradeOf(keyEntry(kLte, "Serving Cell Measurements", "Measured RSSI"), Value("-92.00 dBm")), "none");
}

// The modem's neighbours have RXLEV, those of the telephony service dBm; both have one scale.
TEST(Explanation, OfAGsmNeighbourTakesBothUnits)
{
    const auto* level = keyEntry(kGsm, "Neighboring Cells", "RSSI");
    EXPECT_EQ(numberOf(*level, number(25)), -85);
    EXPECT_EQ(numberOf(*level, Reading(inWholeDbm<signed32>, static_cast<std::uint32_t>(-85))), -85);
    EXPECT_EQ(gradeOf(level, number(25)), "good");
    EXPECT_EQ(gradeOf(level, number(24)), "fair");
    EXPECT_EQ(gradeOf(keyEntry(kGsm, "GSM RR Info", "Serving Rx Level"), number(25)), "good");
    EXPECT_EQ(numberOf(*keyEntry(kGsm, "GSM RR Info", "Serving Rx Level"), number(25)), 25);
    const auto* rscp = keyEntry(kGsm, "UMTS Set", "RSCP");
    EXPECT_EQ(numberOf(*rscp, Reading(inWholeDb<signed32>, static_cast<std::uint32_t>(-85))), -85);
    EXPECT_EQ(gradeOf(rscp, Reading(inWholeDbm<signed32>, static_cast<std::uint32_t>(-85))), "good");
}

// The display shows RXLEV as "31 dBm": the strongest of all levels, if it were one.
TEST(Explanation, OfTheGsmServingCellDoesNotGradeANumberWithAWrongUnit)
{
    EXPECT_EQ(gradeOf(keyEntry(kGsm, "GSM Serving Cell", "RSSI"), Reading(inWholeDbm<signed32>, 31)), "none");
}

TEST(Explanation, OfAnIfxTreeReadsItsTexts)
{
    const auto* level = keyEntryAt(kIfx, "/Serving Cell/RSSI");
    EXPECT_EQ(numberOf(*level, Value("-53 dBm")), -53);
    EXPECT_EQ(gradeOf(level, Value("-53 dBm")), "excellent");
    const auto cell = [](const char* technology) {
        return makeDictionary({{"00;Technology", technology}, {"01;RSSI", "-53 dBm"}});
    };
    EXPECT_EQ(gradeOf(level, Value("-53 dBm"), cell("GSM")), "excellent");
    EXPECT_EQ(gradeOf(level, Value("-53 dBm"), cell("UMTS")), "none");
    EXPECT_EQ(gradeOf(keyEntryAt(kIfx, "/Radio Resource/Status/RxQual"), Value("6")), "poor");
}

TEST(Explanation, OfTheUsersProfileNamesIt)
{
    Thresholds thresholds;
    ASSERT_FALSE(thresholds.read("use ours\nprofile ours\nsource Our rules.\n"
                                 "RSRP excellent -60 good -70 fair -80 poor -90"));
    const auto* entry = keyEntry(kLte, "Neighbor Cells List", "Measured RSRP");
    const auto lines = linesOf(explain(*entry, Value("-92.00 dBm"), nullptr, thresholds));
    EXPECT_EQ(lines[1], "This value: no service, by profile ours (Our rules)");
}

} // namespace
} // namespace kestrum
