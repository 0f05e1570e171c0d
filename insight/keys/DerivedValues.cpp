#include "insight/keys/DerivedValues.h"

#include "insight/keys/Channels.h"
#include "support/Format.h"

#include <algorithm>
#include <charconv>
#include <cmath>

namespace kestrum {
namespace {

/// A number with as many digits as it needs, at most four: "806", "878.49", "934.9875".
std::string shortest(double number)
{
    auto text = formatted("%.4f", number);
    text.erase(text.find_last_not_of('0') + 1);
    if (text.ends_with('.'))
        text.pop_back();
    return text;
}

std::string megahertz(double frequency)
{
    return shortest(frequency) + " MHz";
}

void append(DerivedValues& values, const Carrier& carrier)
{
    values.push_back({"Band", std::string(carrier.band)});
    if (carrier.downlink && carrier.downlink == carrier.uplink) {
        values.push_back({"Frequency", megahertz(*carrier.downlink)});
        return;
    }
    if (carrier.downlink)
        values.push_back({"Downlink", megahertz(*carrier.downlink)});
    if (carrier.uplink)
        values.push_back({"Uplink", megahertz(*carrier.uplink)});
}

template <auto CarriersOf>
DerivedValues carriers(const Given& given)
{
    DerivedValues values;
    if (const auto number = given.whole())
        for (const auto& carrier : CarriersOf(*number))
            append(values, carrier);
    return values;
}

DerivedValues cdmaCarrier(const Given& given, std::string_view bandClassKey)
{
    DerivedValues values;
    const auto bandClass = given.wholeBeside(bandClassKey);
    const auto number = given.whole();
    if (bandClass && number)
        if (const auto carrier = carrierOfCdmaChannel(*bandClass, *number))
            append(values, *carrier);
    return values;
}

/// The value as a number from `least` to `greatest`.
std::optional<std::int64_t> within(const Given& given, std::int64_t least, std::int64_t greatest)
{
    const auto number = given.whole();
    return number && *number >= least && *number <= greatest ? number : std::nullopt;
}

std::string decimal(std::int64_t number)
{
    return std::to_string(number);
}

std::optional<std::int64_t> wholeIn(std::string_view text, int base)
{
    std::int64_t number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number, base);
    return error == std::errc() && end == text.data() + text.size() ? std::optional(number) : std::nullopt;
}

/// "60", "0x2a01" or "Korean PCS band [4]".
std::optional<std::int64_t> wholeIn(std::string_view text)
{
    if (text.starts_with("0x"))
        return wholeIn(text.substr(2), 16);
    if (const auto bracket = text.rfind('['); bracket != std::string_view::npos && text.ends_with(']'))
        return wholeIn(text.substr(bracket + 1, text.size() - bracket - 2), 10);
    return wholeIn(text, 10);
}

std::optional<std::int64_t> wholeOf(const Value& value)
{
    constexpr double kExact = 9007199254740992; // 2^53: doubles up to here are exact
    if (const auto* reading = value.borrowedReading())
        if (const auto number = reading->number())
            return std::fabs(*number) <= kExact && std::trunc(*number) == *number
                       ? std::optional(static_cast<std::int64_t>(*number))
                       : std::nullopt;
    if (const auto text = value.text())
        return wholeIn(*text);
    return std::nullopt;
}

} // namespace

std::string_view shownName(std::string_view key)
{
    const auto order = key.find(';');
    return order == std::string_view::npos || key.find(';', order + 1) != std::string_view::npos
               ? key
               : key.substr(order + 1);
}

std::optional<std::int64_t> Given::whole() const
{
    return wholeOf(value);
}

std::optional<std::int64_t> Given::wholeBeside(std::string_view key) const
{
    if (beside == nullptr)
        return std::nullopt;
    const auto found = std::ranges::find_if(*beside, [&](const auto& entry) { return shownName(entry.key) == key; });
    return found != beside->end() ? wholeOf(found->value) : std::nullopt;
}

DerivedValues fromEarfcn(const Given& given)
{
    return carriers<carriersOfEarfcn>(given);
}

DerivedValues fromNrArfcn(const Given& given)
{
    const auto number = given.whole();
    const auto frequency = number ? frequencyOfNrArfcn(*number) : std::nullopt;
    if (!frequency)
        return {};
    return {{"Frequency", megahertz(*frequency)}};
}

DerivedValues fromDownlinkUarfcn(const Given& given)
{
    return carriers<carriersOfDownlinkUarfcn>(given);
}

DerivedValues fromUplinkUarfcn(const Given& given)
{
    return carriers<carriersOfUplinkUarfcn>(given);
}

DerivedValues fromTddUarfcn(const Given& given)
{
    return carriers<carriersOfTddUarfcn>(given);
}

DerivedValues fromAnyUarfcn(const Given& given)
{
    auto values = fromDownlinkUarfcn(given);
    std::ranges::move(fromTddUarfcn(given), std::back_inserter(values));
    return values;
}

DerivedValues fromArfcn(const Given& given)
{
    return carriers<carriersOfArfcn>(given);
}

DerivedValues fromEvdoChannel(const Given& given)
{
    return cdmaCarrier(given, "Band Class");
}

DerivedValues fromRx0Channel(const Given& given)
{
    return cdmaCarrier(given, "Rx0 Band Class");
}

DerivedValues fromRx1Channel(const Given& given)
{
    return cdmaCarrier(given, "Rx1 Band Class");
}

DerivedValues fromCandidateChannel(const Given& given)
{
    return cdmaCarrier(given, "Band");
}

DerivedValues fromLteBand(const Given& given)
{
    const auto number = given.whole();
    const auto band = number ? lteBand(*number) : std::nullopt;
    if (!band)
        return {};
    const auto text = [](const FrequencyRange& range) { return shortest(range.low) + " to " + megahertz(range.high); };
    if (band->downlink == band->uplink)
        return {{"Frequencies", text(*band->downlink)}, {"Duplex", "TDD"}};
    DerivedValues values{{"Downlink", text(*band->downlink)}};
    if (band->uplink)
        values.push_back({"Uplink", text(*band->uplink)});
    values.push_back({"Duplex", band->uplink ? "FDD" : "downlink only"});
    return values;
}

DerivedValues fromLteBandwidth(const Given& given)
{
    // 3GPP TS 36.101, table 5.6-1.
    struct Bandwidth {
        double megahertz;
        int resourceBlocks;
    };
    constexpr Bandwidth kBandwidths[] = {{1.4, 6}, {3, 15}, {5, 25}, {10, 50}, {15, 75}, {20, 100}};
    const auto* reading = given.value.borrowedReading();
    const auto number = reading != nullptr ? reading->number() : std::nullopt;
    const auto* found = std::ranges::find(kBandwidths, number.value_or(0), &Bandwidth::megahertz);
    if (found == std::end(kBandwidths))
        return {};
    return {{"Resource blocks", decimal(found->resourceBlocks)}};
}

DerivedValues fromLteCellIdentity(const Given& given)
{
    const auto identity = within(given, 0, 0xFFFFFFF);
    if (!identity)
        return {};
    return {{"eNodeB", decimal(*identity >> 8)}, {"Cell of the eNodeB", decimal(*identity & 0xFF)}};
}

DerivedValues fromPhysicalCellId(const Given& given)
{
    const auto identity = within(given, 0, 503);
    if (!identity)
        return {};
    return {{"Group N_ID(1)", decimal(*identity / 3)}, {"Identity in the group N_ID(2)", decimal(*identity % 3)}};
}

DerivedValues fromUtranCellIdentity(const Given& given)
{
    const auto identity = within(given, 0, 0xFFFFFFF);
    if (!identity)
        return {};
    if (*identity <= 0xFFFF)
        return {{"Cell of the RNC", decimal(*identity)}};
    return {{"RNC", decimal(*identity >> 16)}, {"Cell of the RNC", decimal(*identity & 0xFFFF)}};
}

DerivedValues fromCellIdentity(const Given& given)
{
    const auto identity = given.whole();
    return identity && *identity > 0xFFFF ? fromUtranCellIdentity(given) : inHexadecimal(given);
}

DerivedValues fromScramblingCode(const Given& given)
{
    const auto code = within(given, 0, 511);
    if (!code)
        return {};
    return {{"Code group", decimal(*code / 8)}, {"Code in the group", decimal(*code % 8)}};
}

DerivedValues fromCellParameter(const Given& given)
{
    const auto parameter = within(given, 0, 127);
    if (!parameter)
        return {};
    return {{"Code group", decimal(*parameter / 4 + 1)}};
}

DerivedValues fromBsic(const Given& given)
{
    const auto code = within(given, 0, 63);
    if (!code)
        return {};
    return {{"Network colour code", decimal(*code / 8)}, {"Base station colour code", decimal(*code % 8)}};
}

DerivedValues fromPilot(const Given& given)
{
    const auto offset = within(given, 0, 511);
    if (!offset)
        return {};
    constexpr double kChips = 64, kChipsPerMillisecond = 1228.8;
    return {{"Offset", formatted("%.3f ms", static_cast<double>(*offset) * kChips / kChipsPerMillisecond)}};
}

DerivedValues inHexadecimal(const Given& given)
{
    const auto text = given.value.text();
    const auto number = within(given, 0, 0xFFFF);
    if (!number || !text)
        return {};
    if (text->starts_with("0x"))
        return {{"Decimal", decimal(*number)}};
    return {{"Hexadecimal", formatted("0x%04x", static_cast<unsigned>(*number))}};
}

DerivedValues fromRxLev(const Given& given)
{
    constexpr int kHighest = 63, kBelowLowest = -111; // dBm: where RXLEV 0 would begin
    const auto level = within(given, 0, kHighest);
    if (!level)
        return {};
    const std::int64_t from = kBelowLowest + *level;
    if (*level == 0)
        return {{"Level", "below -110 dBm"}};
    if (*level == kHighest)
        return {{"Level", "above -48 dBm"}};
    return {{"Level", decimal(from) + " to " + decimal(from + 1) + " dBm"}};
}

DerivedValues fromRxQual(const Given& given)
{
    constexpr const char* kBitErrors[] = {"below 0.2 %",  "0.2 to 0.4 %", "0.4 to 0.8 %",  "0.8 to 1.6 %",
                                          "1.6 to 3.2 %", "3.2 to 6.4 %", "6.4 to 12.8 %", "above 12.8 %"};
    const auto quality = within(given, 0, 7);
    if (!quality)
        return {};
    return {{"Bit error rate", kBitErrors[*quality]}};
}

DerivedValues fromTimingAdvance(const Given& given)
{
    // A bit takes 48/13 us (3GPP TS 45.010), there and back.
    constexpr double kBit = 48e-6 / 13, kSpeedOfLight = 299792458;
    const auto advance = within(given, 0, 63);
    if (!advance)
        return {};
    const double step = kBit * kSpeedOfLight / 2;
    return {{"Distance", formatted("about %.1f km", static_cast<double>(*advance) * step / 1000)}};
}

DerivedValues fromHoppingSequence(const Given& given)
{
    const auto number = within(given, 0, 63);
    if (!number)
        return {};
    return {{"Hopping", *number == 0 ? "cyclic" : "pseudo-random"}};
}

DerivedValues fromBlockErrors(const Given& given)
{
    const auto received = given.wholeBeside("CRC Received"), wrong = given.wholeBeside("CRC Received in Error");
    if (!received || !wrong || *received <= 0 || *wrong < 0 || *wrong > *received)
        return {};
    return {{"Block error rate",
             formatted("%.2f %%", 100.0 * static_cast<double>(*wrong) / static_cast<double>(*received))}};
}

} // namespace kestrum
