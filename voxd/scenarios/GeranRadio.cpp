#include "voxd/scenarios/GeranRadio.h"

#include "platform/TelephonyService.h"
#include "voxd/scenarios/TelephonyReports.h"

#include <algorithm>
#include <cmath>

namespace kestrum {
namespace {

// Periods in ticks.
constexpr unsigned kMeasurement = 1, kColours = 20, kRanking = 10, kIdentityAgain = 200, kStateAgain = 100,
                   kParametersAgain = 500;

constexpr Carrier kBeacon{945, 24};
constexpr double kMargin = 5;           // dB: the reselection hysteresis
constexpr int kPatience = 8;            // moves
constexpr double kAccessMinimum = -104; // dBm RXLEV_ACCESS_MIN
constexpr int kReselectOffset = 6;      // dB; C2 = C1 + offset (3GPP TS 45.008)
constexpr double kDetectable = -108;    // dBm
constexpr std::size_t kShownNeighbors = 6;

// RXLEV: 0 to 63 in steps of 1 dB from -110 dBm.
std::int64_t receivedLevel(double dbm)
{
    return std::llround(std::clamp(dbm + 110, 0.0, 63.0));
}

std::int64_t pathLossCriterion(double dbm)
{
    return std::llround(dbm - kAccessMinimum);
}

} // namespace

GeranRadio::GeranRadio(const World& world, Random random)
    : _world(world), _random(random), _coverage(world, kBeacon, Random(_random.bits())), _serving(kMargin, kPatience)
{
    camp();
}

void GeranRadio::logServingCell(ModemLog& log, const Traffic& traffic)
{
    log.add(state(Reselection, traffic.isData()));
    log.add(identity());
    log.add(neighborColours());
    log.add(measurement(traffic));
    log.add(hopping(!traffic.isIdle()));
    logPacketParameters(log);
    logState(log, traffic);
}

void GeranRadio::logState(ModemLog& log, const Traffic& traffic)
{
    constexpr State kStates[] = {Idle, Pending, Transfer, Release}; // by phase
    log.add(state(kStates[static_cast<std::size_t>(traffic.phase())], traffic.isData()));
    log.add(discontinuousTransmission(traffic.isActive() && traffic.isVoice()));
    if (traffic.isActive()) {
        log.add(hopping(true));
        log.add(dedicatedChannel());
    }
}

void GeranRadio::tick(ModemLog& log, unsigned number, const Traffic& traffic)
{
    if (isDue(number, kMeasurement))
        log.add(measurement(traffic));
    if (isDue(number, kColours))
        log.add(neighborColours());
    if (isDue(number, kRanking))
        log.add(ranking());
    if (isDue(number, kIdentityAgain))
        log.add(identity());
    if (isDue(number, kStateAgain))
        logState(log, traffic);
    if (isDue(number, kParametersAgain))
        logPacketParameters(log);
}

std::vector<std::size_t> GeranRadio::neighbors() const
{
    return _coverage.others(site(), kShownNeighbors, kDetectable);
}

RecordWriter GeranRadio::state(State state, bool data) const
{
    return RecordWriter(0x512C, 17).set(u8(13), state).set(u8(14), state == Transfer).set(u8(15), 0).set(u8(16), data);
}

// While a channel is in use, the words of the path-loss criteria C1 and C2 hold the received quality.
RecordWriter GeranRadio::measurement(const Traffic& traffic)
{
    const auto near = neighbors();
    const double heard = level(site()) + 0.7 * _random.normal();
    const std::int64_t quality = std::clamp<std::int64_t>(std::llround((-88 - heard) / 3), 0, 7);
    const bool dedicated = traffic.isActive();
    const std::int64_t criterion = pathLossCriterion(heard);
    RecordWriter record(0x5137, 29 + 14 * near.size());
    record.set(u8(15), receivedLevel(heard))
        .set(u32(16), dedicated ? quality : std::max<std::int64_t>(criterion, 0))
        .set(u32(20), dedicated ? std::max<std::int64_t>(quality - 1, 0)
                                : std::max<std::int64_t>(criterion, 0) + kReselectOffset)
        .set(u8(26), 1)
        .set(u8(28), static_cast<std::int64_t>(near.size()));
    for (std::size_t i = 0; i < near.size(); ++i)
        record.part(29 + 14 * i, 14)
            .set(u16(0), gsmCell(_world, near[i]).arfcn)
            .set(u8(2), receivedLevel(level(near[i])))
            .set(u32(3), pathLossCriterion(level(near[i])));
    return record;
}

RecordWriter GeranRadio::neighborColours() const
{
    const auto near = neighbors();
    RecordWriter record(0x51FF, 15 + 4 * near.size());
    record.set(u8(14), static_cast<std::int64_t>(near.size()));
    for (std::size_t i = 0; i < near.size(); ++i) {
        const GsmCell cell = gsmCell(_world, near[i]);
        record.part(15 + 4 * i, 4).set(u16(0), cell.arfcn).set(u8(2), cell.bsic);
    }
    return record;
}

RecordWriter GeranRadio::identity() const
{
    return RecordWriter(0x5134, 26).set(u16(13), cell().arfcn).set(u16(15), cell().bsic).set(u16(17), cell().identity);
}

RecordWriter GeranRadio::dedicatedChannel() const
{
    return RecordWriter(0x5076, 17).set(u16(13), cell().arfcn);
}

// A cell hops over its own frequency and two more. Without a channel there is no hopping.
RecordWriter GeranRadio::hopping(bool dedicated) const
{
    const std::size_t count = dedicated ? 3 : 0;
    RecordWriter record(0x51F8, 15 + 2 * count);
    record.set(u8(13), cell().bsic % 8 + 1).set(u8(14), static_cast<std::int64_t>(count));
    for (std::size_t i = 0; i < count; ++i)
        record.part(15 + 2 * i, 2).set(u16(0), cell().arfcn + static_cast<std::int64_t>(i));
    return record;
}

RecordWriter GeranRadio::discontinuousTransmission(bool on) const
{
    return RecordWriter(0x5072, 20).set(u8(19), on);
}

// System information 13 and related messages (3GPP TS 44.018, 44.060).
void GeranRadio::logPacketParameters(ModemLog& log) const
{
    constexpr int kSi13OnBcch = 0, kPfcSupported = 1, kAccessAllowed = 7, kT3192Of500ms = 0, kT3192Of1000ms = 1;
    const bool abroad = _world.sites()[site()].abroad;
    log.add(RecordWriter(0x51F4, 15).set(u8(14), kSi13OnBcch));
    log.add(RecordWriter(0x51F5, 18).set(u8(13), kPfcSupported).set(u8(14), kAccessAllowed).set(u8(15), abroad));
    log.add(RecordWriter(0x51F6, 24)
                .set(u8(15), abroad ? kT3192Of1000ms : kT3192Of500ms)
                .set(u8(16), abroad ? 4 : 2)
                .set(u8(17), 1));
    log.add(RecordWriter(0x51FB, 34).set(u8(13), 0));
    log.add(RecordWriter(0x51FD, 35).set(u8(13), 1).set(u8(14), 4).set(u8(15), 2).set(u8(16), 0).set(u8(33), 1));
}

RecordWriter GeranRadio::ranking()
{
    // Without UMTS cells: both lists begin at the same byte, so the record can hold only one of them.
    const auto near = neighbors();
    RecordWriter record(0x4005, 15 + 7 * near.size());
    record.set(u8(14), static_cast<std::int64_t>(near.size()));
    for (std::size_t i = 0; i < near.size(); ++i) {
        const GsmCell cell = gsmCell(_world, near[i]);
        const double heard = level(near[i]);
        record.part(15 + 7 * i, 7)
            .set(u16(0), cell.arfcn)
            .set(u16(2), cell.bsic)
            .set(u8(4), std::lround(heard))
            .set(u16(5), pathLossCriterion(heard) + kReselectOffset);
    }
    return record;
}

DictionaryRef GeranRadio::servingReport() const
{
    return cellReport(kVoxCellTechnology_GSM, kVoxCellType_Serving,
                      {{std::string(kVoxCell_CellId), Value(cell().identity)},
                       {std::string(kVoxCell_ARFCN), Value(cell().arfcn)},
                       {std::string(kVoxCell_BandInfo), Value(900)}});
}

void GeranRadio::reportNeighbors(Array& into)
{
    for (const std::size_t near : neighbors()) {
        // Half the level, because the display doubles it.
        const int half = static_cast<int>(std::lround(level(near) / 2));
        into.append(cellReport(kVoxCellTechnology_GSM, kVoxCellType_Neighbor,
                               {{std::string(kVoxCell_ARFCN), Value(gsmCell(_world, near).arfcn)},
                                {std::string(kVoxCell_RSSI), Value(_random.chance(0.1) ? kNotMeasured : half)}}));
    }
}

} // namespace kestrum
