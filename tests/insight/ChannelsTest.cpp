#include "insight/keys/Channels.h"

#include <gtest/gtest.h>

#include <cmath>

namespace kestrum {

// Without it a failure shows bytes.
void PrintTo(const Carrier& carrier, std::ostream* out)
{
    *out << carrier.band << ": " << carrier.downlink.value_or(0) << " / " << carrier.uplink.value_or(0);
}

namespace {

using Carriers = std::vector<Carrier>;

/// A channel number and the only carrier that it stands for.
struct Case {
    const char* name;
    std::int64_t number;
    const char* band;
    double downlink, uplink; ///< MHz; 0: none

    friend void PrintTo(const Case& shown, std::ostream* out) { *out << shown.name; }
};

Carriers carrierOf(const Case& expected)
{
    const auto frequency = [](double megahertz) { return megahertz != 0 ? std::optional(megahertz) : std::nullopt; };
    return {{expected.band, frequency(expected.downlink), frequency(expected.uplink)}};
}

const auto kName = [](const auto& each) { return std::string(each.param.name); };

class Earfcn : public testing::TestWithParam<Case> {};

TEST_P(Earfcn, IsACarrier)
{
    EXPECT_EQ(carriersOfEarfcn(GetParam().number), carrierOf(GetParam()));
}

// The channels of test networks and of well-known operators' carriers, the ends of bands, and each kind of band.
INSTANTIATE_TEST_SUITE_P(
    Channels, Earfcn,
    testing::Values(Case{"FirstOfBand1", 0, "1", 2110, 1920}, Case{"MiddleOfBand1", 300, "1", 2140, 1950},
                    Case{"LastOfBand1", 599, "1", 2169.9, 1979.9}, Case{"Band2", 900, "2", 1960, 1880},
                    Case{"Band3", 1575, "3", 1842.5, 1747.5}, Case{"Band4", 2175, "4", 2132.5, 1732.5},
                    Case{"Band5", 2525, "5", 881.5, 836.5}, Case{"Band7", 3100, "7", 2655, 2535},
                    Case{"Band8", 3625, "8", 942.5, 897.5}, Case{"Band9", 3800, "9", 1844.9, 1749.9},
                    Case{"Band12", 5095, "12", 737.5, 707.5}, Case{"Band13UplinkAbove", 5230, "13", 751, 782},
                    Case{"Band17", 5790, "17", 740, 710}, Case{"Band20", 6300, "20", 806, 847},
                    Case{"Band20AtItsUplink", 24300, "20", 806, 847}, Case{"Band21", 6525, "21", 1503.4, 1455.4},
                    Case{"Band25", 8365, "25", 1962.5, 1882.5}, Case{"Band26", 8865, "26", 876.5, 831.5},
                    Case{"Band28", 9435, "28", 780.5, 725.5}, Case{"Band29HasNoUplink", 9715, "29", 722.5, 0},
                    Case{"Band30", 9820, "30", 2355, 2310}, Case{"Band30AtItsUplink", 27710, "30", 2355, 2310},
                    Case{"Band31", 9895, "31", 465, 455}, Case{"Band32HasNoUplink", 10140, "32", 1474, 0},
                    Case{"Band34Tdd", 36275, "34", 2017.5, 2017.5}, Case{"Band38Tdd", 38000, "38", 2595, 2595},
                    Case{"Band39Tdd", 38450, "39", 1900, 1900}, Case{"Band40Tdd", 39150, "40", 2350, 2350},
                    Case{"Band41Tdd", 40620, "41", 2593, 2593}, Case{"Band42Tdd", 42590, "42", 3500, 3500},
                    Case{"Band43Tdd", 44590, "43", 3700, 3700}, Case{"Band48Tdd", 55990, "48", 3625, 3625},
                    Case{"Band53Tdd", 60197, "53", 2489.2, 2489.2}, Case{"Band65", 65986, "65", 2155, 1965},
                    Case{"Band66", 66786, "66", 2145, 1745}, Case{"Band66WithoutAPair", 67236, "66", 2190, 0},
                    Case{"Band70WithoutAPair", 68560, "70", 2017.4, 0}, Case{"Band71", 68761, "71", 634.5, 680.5},
                    Case{"Band85", 70456, "85", 737, 707}, Case{"Band103", 70655, "103", 757.9, 787.9}),
    kName);

TEST(Channels, EarfcnOfNoBandIsNoCarrier)
{
    for (const std::int64_t number : {-1LL, 4950LL, 10360LL, 35999LL, 60300LL, 65535LL, 70700LL, 134292LL, 1LL << 40})
        EXPECT_EQ(carriersOfEarfcn(number), Carriers()) << number;
}

// Up to band 28 the numbers of a pair differ by 18000.
TEST(Channels, EarfcnsOfAPairLeadToEachOther)
{
    std::size_t pairs = 0;
    for (std::int64_t number = 0; number < 9660; ++number) {
        const auto found = carriersOfEarfcn(number);
        EXPECT_EQ(carriersOfEarfcn(number + 18000), found) << number;
        pairs += found.size();
    }
    // The bands from 1 to 28 have 915 MHz of downlink together.
    EXPECT_EQ(pairs, 9150u);
}

class DownlinkUarfcn : public testing::TestWithParam<Case> {};

TEST_P(DownlinkUarfcn, IsACarrier)
{
    EXPECT_EQ(carriersOfDownlinkUarfcn(GetParam().number), carrierOf(GetParam()));
    if (GetParam().uplink == 0)
        return;
    // The uplink's number, at the same place of its range, is the same carrier.
    int same = 0;
    for (std::int64_t number = 0; number < 10000; ++number)
        same += carriersOfUplinkUarfcn(number) == carrierOf(GetParam());
    EXPECT_EQ(same, 1);
}

INSTANTIATE_TEST_SUITE_P(
    Channels, DownlinkUarfcn,
    testing::Values(Case{"BandI", 10687, "I", 2137.4, 1947.4}, Case{"FirstOfBandI", 10562, "I", 2112.4, 1922.4},
                    Case{"LastOfBandI", 10838, "I", 2167.6, 1977.6}, Case{"BandII", 9800, "II", 1960, 1880},
                    Case{"AdditionalOfBandII", 412, "II", 1932.5, 1852.5}, Case{"BandIII", 1338, "III", 1842.6, 1747.6},
                    Case{"BandIV", 1638, "IV", 2132.6, 1732.6}, Case{"AdditionalOfBandIV", 1887, "IV", 2112.5, 1712.5},
                    Case{"BandV", 4358, "V", 871.6, 826.6}, Case{"AdditionalOfBandV", 1007, "V", 871.5, 826.5},
                    Case{"BandVII", 2400, "VII", 2655, 2535}, Case{"AdditionalOfBandVII", 2587, "VII", 2622.5, 2502.5},
                    Case{"BandVIII", 3013, "VIII", 942.6, 897.6}, Case{"BandIX", 9312, "IX", 1862.4, 1767.4},
                    Case{"BandX", 3112, "X", 2112.4, 1712.4}, Case{"BandXI", 3750, "XI", 1486, 1438},
                    Case{"BandXII", 3872, "XII", 737.4, 707.4}, Case{"AdditionalOfBandXII", 3932, "XII", 731.5, 701.5},
                    Case{"BandXIII", 4030, "XIII", 751, 782}, Case{"BandXIV", 4130, "XIV", 763, 793},
                    Case{"BandXIX", 737, "XIX", 882.4, 837.4}, Case{"BandXX", 4575, "XX", 806, 847},
                    Case{"BandXXI", 887, "XXI", 1503.4, 1455.4}, Case{"BandXXII", 4850, "XXII", 3550, 3450},
                    Case{"BandXXV", 5262, "XXV", 1962.4, 1882.4}, Case{"BandXXVI", 5837, "XXVI", 876.4, 831.4},
                    Case{"BandXXXIIHasNoUplink", 6617, "XXXII", 1454.4, 0}),
    kName);

TEST(Channels, UarfcnOfBandsVAndViIsBoth)
{
    EXPECT_EQ(carriersOfDownlinkUarfcn(4400), (Carriers{{"V", 880.0, 835.0}, {"VI", 880.0, 835.0}}));
    EXPECT_EQ(carriersOfUplinkUarfcn(4175), (Carriers{{"V", 880.0, 835.0}, {"VI", 880.0, 835.0}}));
}

// 412 is a downlink of band II and an uplink of band XIX.
TEST(Channels, UarfcnDependsOnTheDirection)
{
    EXPECT_EQ(carriersOfDownlinkUarfcn(412), (Carriers{{"II", 1932.5, 1852.5}}));
    EXPECT_EQ(carriersOfUplinkUarfcn(412), (Carriers{{"XIX", 882.5, 837.5}}));
    EXPECT_EQ(carriersOfUplinkUarfcn(10687), Carriers());
    EXPECT_EQ(carriersOfDownlinkUarfcn(-1), Carriers());
}

TEST(Channels, UarfcnOfTddIsFiveTimesTheFrequency)
{
    EXPECT_EQ(carriersOfTddUarfcn(10063), (Carriers{{"a", 2012.6, 2012.6}}));
    EXPECT_EQ(carriersOfTddUarfcn(11700), (Carriers{{"e", 2340.0, 2340.0}}));
    EXPECT_EQ(carriersOfTddUarfcn(9525),
              (Carriers{{"a", 1905.0, 1905.0}, {"b", 1905.0, 1905.0}, {"f", 1905.0, 1905.0}}));
    EXPECT_EQ(carriersOfTddUarfcn(10687), Carriers());
}

class Arfcn : public testing::TestWithParam<Case> {};

TEST_P(Arfcn, IsACarrier)
{
    EXPECT_EQ(carriersOfArfcn(GetParam().number), carrierOf(GetParam()));
}

INSTANTIATE_TEST_SUITE_P(
    Channels, Arfcn,
    testing::Values(
        Case{"ZeroOfEgsm", 0, "E-GSM 900", 935, 890}, Case{"FirstOfPgsm", 1, "P-GSM 900", 935.2, 890.2},
        Case{"Pgsm", 60, "P-GSM 900", 947, 902}, Case{"LastOfPgsm", 124, "P-GSM 900", 959.8, 914.8},
        Case{"FirstOfEgsm", 975, "E-GSM 900", 925.2, 880.2}, Case{"LastOfEgsm", 1023, "E-GSM 900", 934.8, 889.8},
        Case{"FirstOfRgsm", 955, "R-GSM 900", 921.2, 876.2}, Case{"FirstOfErgsm", 940, "ER-GSM 900", 918.2, 873.2},
        Case{"First850", 128, "GSM 850", 869.2, 824.2}, Case{"Last850", 251, "GSM 850", 893.8, 848.8},
        Case{"First450", 259, "GSM 450", 460.6, 450.6}, Case{"First480", 306, "GSM 480", 489, 479},
        Case{"First750UplinkAbove", 438, "GSM 750", 747.2, 777.2}, Case{"DcsAbovePcs", 811, "DCS 1800", 1865, 1770},
        Case{"LastOfDcs", 885, "DCS 1800", 1879.8, 1784.8}),
    kName);

TEST(Channels, ArfcnOfDcsAndPcsIsBoth)
{
    EXPECT_EQ(carriersOfArfcn(512), (Carriers{{"DCS 1800", 1805.2, 1710.2}, {"PCS 1900", 1930.2, 1850.2}}));
    EXPECT_EQ(carriersOfArfcn(810), (Carriers{{"DCS 1800", 1864.8, 1769.8}, {"PCS 1900", 1989.8, 1909.8}}));
}

TEST(Channels, ArfcnOfNoBandIsNoCarrier)
{
    for (const std::int64_t number : {-1, 125, 127, 252, 300, 512 - 1 - 74, 886, 939, 1024, 65535})
        EXPECT_EQ(carriersOfArfcn(number), Carriers()) << number;
}

struct CdmaCase {
    const char* name;
    int bandClass, number;
    double downlink, uplink; ///< MHz

    friend void PrintTo(const CdmaCase& shown, std::ostream* out) { *out << shown.name; }
};

class CdmaChannel : public testing::TestWithParam<CdmaCase> {};

TEST_P(CdmaChannel, IsACarrier)
{
    const auto& [name, bandClass, number, downlink, uplink] = GetParam();
    const auto found = carrierOfCdmaChannel(bandClass, number);
    ASSERT_TRUE(found);
    EXPECT_EQ(found->band, std::to_string(bandClass));
    EXPECT_DOUBLE_EQ(*found->downlink, downlink);
    EXPECT_DOUBLE_EQ(*found->uplink, uplink);
}

INSTANTIATE_TEST_SUITE_P(
    Channels, CdmaChannel,
    testing::Values(CdmaCase{"Cellular283", 0, 283, 878.49, 833.49}, CdmaCase{"Cellular384", 0, 384, 881.52, 836.52},
                    CdmaCase{"CellularBelow825", 0, 1013, 869.7, 824.7},
                    CdmaCase{"CellularAbove1023", 0, 1024, 860.04, 815.04}, CdmaCase{"Pcs25", 1, 25, 1931.25, 1851.25},
                    CdmaCase{"Pcs1175", 1, 1175, 1988.75, 1908.75}, CdmaCase{"Tacs", 2, 1, 935.0125, 890.0125},
                    CdmaCase{"TacsLow", 2, 1329, 917.0125, 872.0125}, CdmaCase{"Jtacs", 3, 76, 860.95, 915.95},
                    CdmaCase{"KoreanPcs", 4, 25, 1841.25, 1751.25}, CdmaCase{"Band450", 5, 160, 463.975, 453.975},
                    CdmaCase{"Band410", 5, 539, 421.675, 411.675}, CdmaCase{"Imt", 6, 50, 2112.5, 1922.5},
                    CdmaCase{"Band700UplinkAbove", 7, 50, 748.5, 778.5}, CdmaCase{"Band1800", 8, 100, 1810, 1715},
                    CdmaCase{"Band900", 9, 100, 930, 885}, CdmaCase{"Secondary800", 10, 100, 853.5, 808.5},
                    CdmaCase{"Secondary900", 10, 720, 935, 896}, CdmaCase{"Pamr400", 11, 472, 420, 410},
                    CdmaCase{"Pamr800", 12, 0, 915.0125, 870.0125}),
    kName);

TEST(Channels, CdmaChannelNeedsABandClassAndItsNumber)
{
    EXPECT_FALSE(carrierOfCdmaChannel(13, 283));
    EXPECT_FALSE(carrierOfCdmaChannel(-1, 283));
    EXPECT_FALSE(carrierOfCdmaChannel(0, 0));
    EXPECT_FALSE(carrierOfCdmaChannel(0, 800));
    EXPECT_FALSE(carrierOfCdmaChannel(1, 1200));
}

TEST(Channels, NrArfcnIsAFrequency)
{
    EXPECT_EQ(frequencyOfNrArfcn(0), 0.0);
    EXPECT_EQ(frequencyOfNrArfcn(361000), 1805.0);
    EXPECT_EQ(frequencyOfNrArfcn(599999), 2999.995);
    EXPECT_EQ(frequencyOfNrArfcn(600000), 3000.0);
    EXPECT_EQ(frequencyOfNrArfcn(636666), 3549.99);
    EXPECT_EQ(frequencyOfNrArfcn(2016667), 24250.08);
    EXPECT_EQ(frequencyOfNrArfcn(2079167), 28000.08);
    EXPECT_FALSE(frequencyOfNrArfcn(-1));
    EXPECT_FALSE(frequencyOfNrArfcn(3279166));
}

TEST(Channels, LteBandHasItsFrequencies)
{
    EXPECT_EQ(lteBand(20)->downlink, (FrequencyRange{791, 821}));
    EXPECT_EQ(lteBand(20)->uplink, (FrequencyRange{832, 862}));
    EXPECT_EQ(lteBand(66)->downlink, (FrequencyRange{2110, 2200}));
    EXPECT_EQ(lteBand(66)->uplink, (FrequencyRange{1710, 1780}));
    EXPECT_EQ(lteBand(29)->uplink, std::nullopt);
    EXPECT_EQ(lteBand(41)->downlink, (FrequencyRange{2496, 2690}));
    EXPECT_EQ(lteBand(41)->uplink, (FrequencyRange{2496, 2690}));
    EXPECT_FALSE(lteBand(15));
    EXPECT_FALSE(lteBand(0));
}

} // namespace
} // namespace kestrum
