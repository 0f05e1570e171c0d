#include "LogGenerator/C2K/BandClass.h"
#include "LogGenerator/C2K/Decoders.h"
#include "LogGenerator/C2K/Quantities.h"
#include "LogGenerator/C2K/Subpackets.h"
#include "platform/SystemLog.h"

#include <algorithm>
#include <cmath>

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 17;
constexpr std::uint32_t kTraffic = 8;

enum Subpacket : std::uint32_t { kState = 1, kRf = 2, kActiveSet = 3, kFingers = 4 };

std::string deviceState(std::uint32_t raw)
{
    constexpr std::string_view kNames[] = {"Inactive [0]",
                                           "Deep sleep in start state [1]",
                                           "Initial state for CDMA operation [2]",
                                           "Acquisition [3]",
                                           "Sync [4]",
                                           "Slew [5]",
                                           "Paging [6]",
                                           "Slotted mode sleep state [7]",
                                           "Traffic [8]",
                                           "UnSlew [9]",
                                           "Operation in PCG state [10]",
                                           "Powerup state [11]"};
    if (raw < std::size(kNames))
        return std::string(kNames[raw]);
    return formatted("[Bad Value %d]", static_cast<std::int32_t>(raw));
}

/// Receive AGC: 334/1000 dB a step, 0 at -63.248 dBm.
constexpr double receiveAgc(std::uint32_t raw)
{
    return signed8(raw) * 334 / 1000.0 - 63.248;
}

/// Transmit AGC in tenths of dBm.
constexpr double transmitAgc(std::uint32_t raw)
{
    return signed16(raw) / 10.0;
}

template <auto Level>
constexpr Quantity kSignedDbm{[](Quantity::Raw raw) { return formatted("%+.2f dBm", Level(fieldOf(raw))); },
                              numberOf<Level>, "dBm"};

std::string referenceStrength(double decibels)
{
    return formatted("(ref pilot) %+.2f dB", decibels);
}
constexpr Quantity kReferenceStrength = computedQuantity<referenceStrength>("dB");

std::string oldFrameErrors(double percent)
{
    return formatted("%.02f%% (old)", percent);
}
constexpr Quantity kOldFrameErrors = computedQuantity<oldFrameErrors>("%");

// clang-format off
// Offsets from the first byte of the subpacket.
constexpr Field kDeviceState = u8(4);

constexpr Row kStateRows[] = {
    {kDeviceState, "k1xDeviceState",  named<deviceState>},
};
constexpr Row kChain0[] = {
    {u8(4),        "k1xRx0BandClass", named<bandClassName>},
    {u16(6),       "k1xRx0ChanNum",   decimalSigned32},
    {u8(10),       "k1xRxAGC0",       kSignedDbm<receiveAgc>},
};
constexpr Row kChain1[] = {
    {u8(5),        "k1xRx1BandClass", named<bandClassName>},
    {u16(8),       "k1xRx1ChanNum",   decimalSigned32},
    {u8(11),       "k1xRxAGC1",       kSignedDbm<receiveAgc>},
    {u16(12),      "k1xTxAGC",        kSignedDbm<transmitAgc>},
};
// clang-format on
constexpr std::size_t kRfLength = std::max(reach(kChain0), reach(kChain1));
constexpr std::size_t kActiveSetLength = 12;

/// 10 log10 of the pilot's share of the received power, at least -50 dB. Not-a-number gives -50 dB too, because every
/// comparison with it is false.
double strengthDb(double n, double gain, double k, double energy)
{
    constexpr double kFloor = 0.00001;
    const double share = std::exp2(2.0 * k - 3.0) * energy / (gain * 9.0 * n * n) - 1.0 / n;
    return 10.0 * std::log10(share > kFloor ? share : kFloor);
}

/// Publishes {"_sorted", "0;PN": strength, ...}, up to the first pilot that does not lie inside the record.
void listPilots(Record activeSet, Dictionary& shown)
{
    const auto field = [&](Field which) { return activeSet.read(which).value_or(0); };
    const auto n = field(u16(4)), gain = field(u8(6)), k = field(u8(7)), count = field(u8(8)), m = field(u8(9));
    const auto reference = field(u16(10));
    const std::size_t size = (std::size_t{6} * m + 15) / 4 * 4;

    shown.setText(kSortedKey, kSortedKey);
    for (std::uint32_t j = 0; j < count; ++j) {
        const auto pnField = activeSet.slice(12 + size * j, 2);
        const auto energyField = activeSet.slice(24 + 4 * m + size * j, 2);
        if (!pnField || !energyField)
            break;
        const auto pn = pnField->read(u16(0)).value_or(0);
        shown.set(formatted("%d;%d", static_cast<std::int32_t>(j), static_cast<std::int32_t>(pn)),
                  Reading::computed(pn == reference ? QuantityRef(kReferenceStrength) : QuantityRef(kPilotStrength),
                                    strengthDb(n, gain, k, energyField->read(u16(0)).value_or(0))));
    }
}

} // namespace

void decodeOneXStatus(Record record, C2KContext& context)
{
    if (record.size() < kMinimumLength) {
        context.rejectLength(formatted("Log code 0x119c is %u bytes long but must be at least %lu bytes.",
                                       static_cast<unsigned>(record.size()), kMinimumLength));
        return;
    }
    const auto state = findSubpacket(record, kState, context.log);
    const auto rf = findSubpacket(record, kRf, context.log);
    const auto activeSet = findSubpacket(record, kActiveSet, context.log);
    const auto fingers = findSubpacket(record, kFingers, context.log); // must be present; its fields are not read
    if (!state || !rf || !activeSet || !fingers) {
        context.log.write(Priority::Warning, "Log code 0x119c: missing subpacket (ss=%d,rf=%d,ai=%d,fi=%d).",
                          state ? 1 : 0, rf ? 1 : 0, activeSet ? 1 : 0, fingers ? 1 : 0);
        return;
    }
    const auto deviceStateNow = state->read(kDeviceState);
    if (!deviceStateNow || rf->size() < kRfLength || activeSet->size() < kActiveSetLength)
        return;

    const bool inTraffic = *deviceStateNow == kTraffic;
    context.publish(*state, kStateRows);
    context.publish(*rf, kChain0);
    if (inTraffic)
        context.publish(*rf, kChain1);
    else
        for (const auto& row : kChain1)
            context.publish(row.key, "N/A");
    context.publish("k1xActiveSetInfo", [&](Value& shown) { listPilots(*activeSet, shown.becomeDictionary()); });

    // Publishes the frame errors of the last call once, after its end.
    if (const auto ratio = context.state.at("TrafficFER").real(); ratio && !inTraffic) {
        context.publish("k1xTrafficFER", Reading::computed(kOldFrameErrors, *ratio * 100.0));
        context.state.remove("TrafficFER");
    }
}

} // namespace kestrum
