#include "insight/keys/DerivedValues.h"

#include "LogGenerator/Quantities.h"

#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

namespace kestrum {
namespace {

/// "Downlink 806 MHz; Uplink 847 MHz"
std::string derived(Derive* derive, const Value& value, const DictionaryRef& beside = nullptr)
{
    std::string all;
    for (const auto& [name, text] : derive(Given{value, beside.get()}))
        all += (all.empty() ? "" : "; ") + name + ' ' + text;
    return all;
}

Value reading(std::uint32_t raw)
{
    return Reading(decimalSigned32, raw);
}

double asSent(std::uint32_t raw)
{
    return raw / 10.0;
}
constexpr Quantity kTenths{[](Quantity::Raw raw) { return std::to_string(raw); }, numberOf<asSent>, "MHz"};

TEST(DerivedValues, OfChannels)
{
    EXPECT_EQ(derived(fromEarfcn, reading(6300)), "Band 20; Downlink 806 MHz; Uplink 847 MHz");
    EXPECT_EQ(derived(fromEarfcn, reading(9715)), "Band 29; Downlink 722.5 MHz");
    EXPECT_EQ(derived(fromEarfcn, reading(38000)), "Band 38; Frequency 2595 MHz");
    EXPECT_EQ(derived(fromDownlinkUarfcn, reading(10687)), "Band I; Downlink 2137.4 MHz; Uplink 1947.4 MHz");
    EXPECT_EQ(derived(fromUplinkUarfcn, reading(9737)), "Band I; Downlink 2137.4 MHz; Uplink 1947.4 MHz");
    EXPECT_EQ(derived(fromTddUarfcn, reading(10063)), "Band a; Frequency 2012.6 MHz");
    EXPECT_EQ(derived(fromAnyUarfcn, reading(10063)), "Band a; Frequency 2012.6 MHz");
    EXPECT_EQ(derived(fromAnyUarfcn, reading(10687)), "Band I; Downlink 2137.4 MHz; Uplink 1947.4 MHz");
    EXPECT_EQ(derived(fromArfcn, reading(60)), "Band P-GSM 900; Downlink 947 MHz; Uplink 902 MHz");
    EXPECT_EQ(
        derived(fromArfcn, Value("600")),
        "Band DCS 1800; Downlink 1822.8 MHz; Uplink 1727.8 MHz; Band PCS 1900; Downlink 1947.8 MHz; Uplink 1867.8 "
        "MHz");
}

TEST(DerivedValues, OfACdmaChannelNeedTheBandClassBesideIt)
{
    const auto radio = makeDictionary({{"_sorted", "_sorted"},
                                       {"0;Rx0 Band Class", "800 MHz cellular band [0]"},
                                       {"3;Rx1 Band Class", "1.8 to 2.0GHz PCS band [1]"}});
    EXPECT_EQ(derived(fromRx0Channel, reading(283), radio), "Band 0; Downlink 878.49 MHz; Uplink 833.49 MHz");
    EXPECT_EQ(derived(fromRx1Channel, reading(25), radio), "Band 1; Downlink 1931.25 MHz; Uplink 1851.25 MHz");
    EXPECT_EQ(derived(fromEvdoChannel, reading(283), radio), "");
    EXPECT_EQ(derived(fromRx0Channel, reading(283)), "");
    EXPECT_EQ(derived(fromRx0Channel, Value("N/A"), radio), "");
    EXPECT_EQ(derived(fromEvdoChannel, reading(1), makeDictionary({{"0;Band Class", "[Bad Value 31]"}})), "");
    EXPECT_EQ(derived(fromCandidateChannel, reading(283), makeDictionary({{"Band", reading(0)}})),
              "Band 0; Downlink 878.49 MHz; Uplink 833.49 MHz");
}

TEST(DerivedValues, OfLteBands)
{
    EXPECT_EQ(derived(fromLteBand, reading(20)), "Downlink 791 to 821 MHz; Uplink 832 to 862 MHz; Duplex FDD");
    EXPECT_EQ(derived(fromLteBand, reading(38)), "Frequencies 2570 to 2620 MHz; Duplex TDD");
    EXPECT_EQ(derived(fromLteBand, reading(32)), "Downlink 1452 to 1496 MHz; Duplex downlink only");
    EXPECT_EQ(derived(fromLteBand, reading(99)), "");
    EXPECT_EQ(derived(fromLteBandwidth, Reading(kTenths, 100)), "Resource blocks 50");
    EXPECT_EQ(derived(fromLteBandwidth, Reading(kTenths, 14)), "Resource blocks 6");
    EXPECT_EQ(derived(fromLteBandwidth, Reading(kTenths, 0)), "");
    EXPECT_EQ(derived(fromLteBandwidth, Value("Unknown")), "");
}

TEST(DerivedValues, OfIdentities)
{
    EXPECT_EQ(derived(fromLteCellIdentity, reading(1712898)), "eNodeB 6691; Cell of the eNodeB 2");
    EXPECT_EQ(derived(fromLteCellIdentity, reading(0xFFFFFFF)), "eNodeB 1048575; Cell of the eNodeB 255");
    EXPECT_EQ(derived(fromLteCellIdentity, reading(0x10000000)), "");
    EXPECT_EQ(derived(fromLteCellIdentity, reading(0xFFFFFFFF)), "");
    EXPECT_EQ(derived(fromPhysicalCellId, reading(232)), "Group N_ID(1) 77; Identity in the group N_ID(2) 1");
    EXPECT_EQ(derived(fromPhysicalCellId, reading(504)), "");
    EXPECT_EQ(derived(fromUtranCellIdentity, reading(18877210)), "RNC 288; Cell of the RNC 2842");
    EXPECT_EQ(derived(fromUtranCellIdentity, reading(2842)), "Cell of the RNC 2842");
    EXPECT_EQ(derived(fromCellIdentity, Value("18877210")), "RNC 288; Cell of the RNC 2842");
    EXPECT_EQ(derived(fromCellIdentity, Value("0x2a01")), "Decimal 10753");
    EXPECT_EQ(derived(fromNrArfcn, Value("636666")), "Frequency 3549.99 MHz");
    EXPECT_EQ(derived(fromScramblingCode, reading(213)), "Code group 26; Code in the group 5");
    EXPECT_EQ(derived(fromScramblingCode, reading(512)), "");
    EXPECT_EQ(derived(fromCellParameter, reading(104)), "Code group 27");
    EXPECT_EQ(derived(fromBsic, reading(28)), "Network colour code 3; Base station colour code 4");
    EXPECT_EQ(derived(fromBsic, Value("64")), "");
    EXPECT_EQ(derived(fromPilot, reading(424)), "Offset 22.083 ms");
    EXPECT_EQ(derived(inHexadecimal, reading(4354)), "Hexadecimal 0x1102");
    EXPECT_EQ(derived(inHexadecimal, Value("0x2a01")), "Decimal 10753");
    EXPECT_EQ(derived(inHexadecimal, Value("-1")), "");
}

TEST(DerivedValues, OfIndexes)
{
    EXPECT_EQ(derived(fromRxLev, reading(0)), "Level below -110 dBm");
    EXPECT_EQ(derived(fromRxLev, reading(1)), "Level -110 to -109 dBm");
    EXPECT_EQ(derived(fromRxLev, reading(31)), "Level -80 to -79 dBm");
    EXPECT_EQ(derived(fromRxLev, reading(62)), "Level -49 to -48 dBm");
    EXPECT_EQ(derived(fromRxLev, reading(63)), "Level above -48 dBm");
    EXPECT_EQ(derived(fromRxLev, reading(64)), "");
    EXPECT_EQ(derived(fromRxQual, reading(0)), "Bit error rate below 0.2 %");
    EXPECT_EQ(derived(fromRxQual, Value("7")), "Bit error rate above 12.8 %");
    EXPECT_EQ(derived(fromRxQual, reading(25)), "");
    EXPECT_EQ(derived(fromTimingAdvance, Value("2")), "Distance about 1.1 km");
    EXPECT_EQ(derived(fromTimingAdvance, Value("63")), "Distance about 34.9 km");
    EXPECT_EQ(derived(fromHoppingSequence, reading(0)), "Hopping cyclic");
    EXPECT_EQ(derived(fromHoppingSequence, reading(4)), "Hopping pseudo-random");
}

TEST(DerivedValues, OfBlockErrorsNeedBothCounters)
{
    const auto counters = [](std::uint32_t received, std::uint32_t wrong) {
        return makeDictionary({{"CRC Received", reading(received)}, {"CRC Received in Error", reading(wrong)}});
    };
    EXPECT_EQ(derived(fromBlockErrors, reading(3), counters(400, 3)), "Block error rate 0.75 %");
    EXPECT_EQ(derived(fromBlockErrors, reading(0), counters(0, 0)), "");
    EXPECT_EQ(derived(fromBlockErrors, reading(9), counters(3, 9)), "");
    EXPECT_EQ(derived(fromBlockErrors, reading(3)), "");
}

// Nothing of what a display may hold stops the program.
RC_GTEST_PROP(DerivedValues, OfAnyTextAndAnyNumberAreBounded, (const std::string& text, std::uint32_t raw))
{
    Derive* const all[] = {
        fromNrArfcn,         fromCellIdentity,      fromEarfcn,         fromDownlinkUarfcn, fromUplinkUarfcn,
        fromTddUarfcn,       fromAnyUarfcn,         fromArfcn,          fromEvdoChannel,    fromRx0Channel,
        fromRx1Channel,      fromCandidateChannel,  fromLteBand,        fromLteBandwidth,   fromLteCellIdentity,
        fromPhysicalCellId,  fromUtranCellIdentity, fromScramblingCode, fromCellParameter,  fromBsic,
        fromPilot,           inHexadecimal,         fromRxLev,          fromRxQual,         fromTimingAdvance,
        fromHoppingSequence, fromBlockErrors};
    const auto beside = makeDictionary({{text, text}, {"Band", text}, {"CRC Received", reading(raw)}});
    for (const Value& value : {Value(text), reading(raw), Value(), Value(makeArray()), Value("[" + text + "]")})
        for (auto* derive : all)
            RC_ASSERT(derive(Given{value, beside.get()}).size() <= 9);
}

} // namespace
} // namespace kestrum
