#include "voxd/scenarios/UtraRadio.h"

#include "platform/TelephonyService.h"
#include "voxd/scenarios/TelephonyReports.h"

#include <algorithm>
#include <cmath>

namespace kestrum {
namespace {

// Periods in ticks.
constexpr unsigned kSearcher = 1, kRanking = 10, kTransmitPower = 2, kBlockErrors = 20, kHarq = 20,
                   kIdentityAgain = 200, kStateAgain = 100;

constexpr Carrier kPilot{2137.4, 16};
constexpr double kMargin = 3;         // dB
constexpr int kPatience = 6;          // moves
constexpr double kNoise = -99;        // dBm in 3.84 MHz
constexpr double kCellLoad = 5.5;     // a cell's power as a multiple of its pilot's power
constexpr double kDetectable = -116;  // dBm RSCP
constexpr double kSoftHandover = 4.5; // dB below the best; stronger cells are in the active set
constexpr std::size_t kShownNeighbors = 6, kActive = 3;
constexpr std::size_t kProcesses = 6; // HARQ (3GPP TS 25.321)

} // namespace

UtraRadio::UtraRadio(const World& world, Random random)
    : _world(world),
      _random(random),
      _coverage(world, kPilot, Random(_random.bits()), true),
      _serving(kMargin, kPatience)
{
    camp();
}

void UtraRadio::logServingCell(ModemLog& log)
{
    log.add(identity());
    log.add(searcher(RrcState::Disconnected));
    log.add(ranking());
}

void UtraRadio::logState(ModemLog& log, const Traffic* traffic)
{
    const RrcState now = traffic != nullptr ? rrcState(*traffic, _world) : RrcState::Disconnected;
    log.add(RecordWriter(0x4125, 14).set(u8(13), static_cast<std::int64_t>(now)));
    log.add(RecordWriter(0x4157, 19).set(u8(13), now > RrcState::Connecting));
}

void UtraRadio::tick(ModemLog& log, unsigned number, const Traffic& traffic)
{
    const RrcState now = rrcState(traffic, _world);
    if (isDue(number, kSearcher))
        log.add(searcher(now));
    if (isDue(number, kRanking))
        log.add(ranking());
    if (now == RrcState::Dch || now == RrcState::Fach) {
        if (isDue(number, kTransmitPower))
            log.add(transmitPower());
        if (isDue(number, kBlockErrors))
            log.add(blockErrors());
        if (traffic.isData() && isDue(number, kHarq))
            log.add(harq(traffic));
    }
    if (isDue(number, kIdentityAgain))
        log.add(identity());
    if (isDue(number, kStateAgain))
        logState(log, &traffic);
}

std::vector<std::size_t> UtraRadio::neighbors() const
{
    return _coverage.others(site(), kShownNeighbors, kDetectable);
}

double UtraRadio::allPower() const
{
    return dbm(_coverage.total() * kCellLoad + milliwatts(kNoise));
}

double UtraRadio::energy(std::size_t site) const
{
    return std::clamp(_coverage.level(site) - allPower(), -24.0, 0.0);
}

// The serving cell first, then the cells near it: the active set before the monitored set.
RecordWriter UtraRadio::searcher(RrcState state)
{
    constexpr int kActiveSet = 0, kMonitoredSet = 1;
    constexpr std::size_t kCell = 15, kMeasurement = 44;
    constexpr double kFullScale = 524288; // energy of 0 dB
    auto cells = neighbors();
    cells.insert(cells.begin(), site());
    RecordWriter record(0x417A, 16 + (kCell + kMeasurement) * cells.size());
    // Received power in 0.1 dB steps from -106 dBm at -512.
    record.set(u16(13), std::lround(10 * (allPower() + 0.3 * _random.normal() + 106)) - 512)
        .set(u8(15), static_cast<std::int64_t>(cells.size()));
    for (std::size_t i = 0; i < cells.size(); ++i) {
        const bool near = _coverage.level(cells[i]) > level() - kSoftHandover && i < kActive;
        const bool active = i == 0 || (state == RrcState::Dch && near);
        record.part(16 + kCell * i, kCell)
            .set(u16(7).bits(0, 12), umtsCell(_world, cells[i]).scramblingCode)
            .set(u16(7).bits(13, 15), active ? kActiveSet : kMonitoredSet);
        record.part(16 + kCell * cells.size() + kMeasurement * i, kMeasurement)
            .set(u32(32), std::llround(kFullScale * milliwatts(energy(cells[i]))));
    }
    return record;
}

RecordWriter UtraRadio::ranking() const
{
    // Without GSM cells: both lists begin at the same byte, so the record can hold only one of them.
    auto cells = neighbors();
    cells.insert(cells.begin(), site());
    RecordWriter record(0x4005, 15 + 10 * cells.size());
    record.set(u8(13), static_cast<std::int64_t>(cells.size()));
    for (std::size_t i = 0; i < cells.size(); ++i) {
        const UmtsCell cell = umtsCell(_world, cells[i]);
        const auto level = std::lround(std::clamp(_coverage.level(cells[i]), -120.0, -25.0));
        record.part(15 + 10 * i, 10)
            .set(u16(0), cell.uarfcn)
            .set(u16(2), cell.scramblingCode)
            .set(u8(4), level + 21)
            .set(u16(5), level)
            .set(u8(7), std::lround(2 * energy(cells[i])))
            .set(u16(8), level + (i == 0 ? 4 : 0)); // the hysteresis favours the serving cell
    }
    return record;
}

RecordWriter UtraRadio::identity() const
{
    return RecordWriter(0x4127, 29)
        .set(u32(13), cell().uplinkUarfcn)
        .set(u32(17), cell().uarfcn)
        .set(u32(21), cell().identity)
        .set(u16(25), cell().registrationArea);
}

// In steps of 0.1 dB from -70 dBm at -512, one entry per slot. 0 would mean "no value".
RecordWriter UtraRadio::transmitPower()
{
    constexpr std::size_t kSlots = 4, kEntry = 14;
    constexpr double kHighest = 24, kLowest = -50; // dBm
    RecordWriter record(0x4031, 16 + kEntry * kSlots);
    record.set(u8(14), kSlots);
    for (std::size_t i = 0; i < kSlots; ++i) {
        // The phone sends more power the weaker the cell is (open loop, 3GPP TS 25.331).
        const double power = std::clamp(-95 - level() + _random.normal(), kLowest, kHighest);
        const auto raw = std::lround(10 * (power + 70)) - 512;
        record.part(16 + kEntry * i, kEntry).set(u16(4), raw == 0 ? 1 : raw);
    }
    return record;
}

// Blocks since the modem's start: the counters only increase.
RecordWriter UtraRadio::blockErrors()
{
    constexpr int kWindow = 50;
    const double errorRate = std::clamp((-12 - energy(site())) * 0.01, 0.002, 0.1);
    RecordWriter record(0x4116, 16 + 9 * _channels.size());
    record.set(u8(13), static_cast<std::int64_t>(_channels.size())).set(u16(14), kWindow);
    for (std::size_t i = 0; i < _channels.size(); ++i) {
        auto& channel = _channels[i];
        for (int block = _random.whole(6, 10); block > 0; --block) {
            ++channel.received;
            channel.wrong += _random.chance(errorRate);
        }
        record.part(16 + 9 * i, 9)
            .set(u8(0), static_cast<std::int64_t>(i) + 1)
            .set(u32(1), channel.received)
            .set(u32(5), channel.wrong);
    }
    return record;
}

// The blocks that the processes received in the sub-frames (2 ms) since the last record.
RecordWriter UtraRadio::harq(const Traffic& traffic)
{
    constexpr std::size_t kEntry = 9;
    constexpr int kSubFrames = 100, kBlock = 7168, kSingleCarrier = 0, kDualCarrier = 2;
    // The network abroad has two carriers. The second carrier's entries begin 162 bytes per first-carrier entry
    // further on.
    const bool dual = _world.sites()[site()].abroad;
    const std::size_t secondary = 18 + 162 * kProcesses;
    RecordWriter record(0x4221, dual ? secondary + kEntry * kProcesses : 18 + kEntry * kProcesses);
    record.set(u8(13), 2)
        .set(u16(14).bits(0, 9), kSubFrames)
        .set(u16(14).bits(10, 11), dual ? kDualCarrier : kSingleCarrier)
        .set(u8(16), kProcesses)
        .set(u8(17), dual ? kProcesses : 0);
    const auto put = [&](std::size_t offset) {
        for (std::size_t i = 0; i < kProcesses; ++i) {
            const auto sent = std::lround(traffic.load() * kSubFrames / kProcesses);
            const auto wrong = _random.whole(0, static_cast<int>(sent) / 8);
            record.part(offset + kEntry * i, kEntry)
                .set(u8(0), static_cast<std::int64_t>(i))
                .set(u32(1), (sent - wrong) * kBlock)
                .set(u16(5), sent)
                .set(u16(7), wrong);
        }
    };
    put(18);
    if (dual)
        put(secondary);
    return record;
}

DictionaryRef UtraRadio::servingReport() const
{
    return cellReport(kVoxCellTechnology_UMTS, kVoxCellType_Serving,
                      {{std::string(kVoxCell_CellId), Value(cell().identity)},
                       {std::string(kVoxCell_UARFCN), Value(cell().uarfcn)},
                       {std::string(kVoxCell_ScramblingCode), Value(cell().scramblingCode)},
                       {std::string(kVoxCell_BandInfo), Value(1)}});
}

void UtraRadio::reportNeighbors(Array& into)
{
    for (const std::size_t near : neighbors()) {
        const auto number = [&](double measured) {
            return Value(_random.chance(0.1) ? kNotMeasured : static_cast<int>(std::lround(measured)));
        };
        into.append(cellReport(kVoxCellTechnology_UMTS, kVoxCellType_Neighbor,
                               {{std::string(kVoxCell_UARFCN), Value(umtsCell(_world, near).uarfcn)},
                                {std::string(kVoxCell_ScramblingCode), Value(umtsCell(_world, near).scramblingCode)},
                                {std::string(kVoxCell_RSCP), number(_coverage.level(near))},
                                {std::string(kVoxCell_EcNo), number(energy(near))}}));
    }
}

} // namespace kestrum
