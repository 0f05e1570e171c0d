#include "voxd/scenarios/UtranModem.h"

#include "platform/TelephonyService.h"
#include "voxd/scenarios/Cells.h"
#include "voxd/scenarios/Coverage.h"
#include "voxd/scenarios/RrcState.h"
#include "voxd/scenarios/TelephonyReports.h"
#include "voxd/scenarios/Traffic.h"

#include <algorithm>
#include <cmath>

namespace kestrum {
namespace {

// Periods in ticks.
constexpr unsigned kNeighbors = 1, kGsmNeighbors = 10, kLinkQuality = 2, kStateAgain = 100, kCellAgain = 200,
                   kCellMonitor = 100, kPdpAgain = 1000, kSimAgain = 3000;

constexpr Carrier kPilot{2015, 20}, kBeacon{945, 24};
constexpr double kMargin = 3;        // dB
constexpr int kPatience = 6;         // moves
constexpr double kDetectable = -113; // dBm RSCP
constexpr double kGsmDetectable = -104;
constexpr std::size_t kShownNeighbors = 8;
constexpr int kBand = 34; // 2010 to 2025 MHz

class UtranModem final : public Modem {
public:
    UtranModem(const World& world, Random random)
        : _world(world),
          _random(random),
          _traffic(Random(_random.bits())),
          _coverage(world, kPilot, Random(_random.bits())),
          _gsm(world, kBeacon, Random(_random.bits()))
    {}

    std::string_view technology() const override { return kVoxLogChannelTechnology_Zephra_UTRAN2; }
    std::vector<ScenarioCell> servingCells() const override { return {{"TD-SCDMA", cell().identity}}; }

    void begin(ModemLog& log) override
    {
        receive();
        _serving.choose(_coverage.strongest());
        log.add(state());
        logServingCell(log);
        logSim(log);
        logPdp(log);
    }

    void move(ModemLog& log) override
    {
        receive();
        const int area = cell().locationArea;
        const bool changed = _serving.follow(_coverage);
        if (changed)
            logServingCell(log);
        if (area != cell().locationArea)
            logSim(log);
        if (_traffic.pass(kMoveSeconds)) {
            log.add(state());
            logPdp(log);
        }
    }

    void tick(ModemLog& log, unsigned number) override
    {
        if (isDue(number, kNeighbors))
            log.add(neighborMeasurement());
        if (isDue(number, kGsmNeighbors))
            log.add(gsmMeasurement());
        if (isDue(number, kLinkQuality))
            log.add(linkQuality());
        if (isDue(number, kStateAgain))
            log.add(state());
        if (isDue(number, kCellAgain))
            log.add(servingCell());
        if (isDue(number, kCellMonitor))
            log.add(kCellMonitorRecord, cells());
        if (isDue(number, kPdpAgain))
            logPdp(log);
        if (isDue(number, kSimAgain))
            logSim(log);
    }

private:
    void receive()
    {
        _coverage.move();
        _gsm.move();
    }
    TddCell cell() const { return tddCell(_world, _serving.site()); }
    double level() const { return _coverage.level(_serving.site()); }

    void logServingCell(ModemLog& log)
    {
        log.add(servingCell());
        // The phone has not read its system information yet.
        _identified = false;
        log.add(kCellMonitorRecord, cells());
    }
    void logSim(ModemLog& log)
    {
        const int routingArea = gsmCell(_world, _serving.site()).routingArea;
        log.add(kSimFilesRecord, simReport(_world.plmn(_serving.site()), cell().locationArea, routingArea));
    }
    void logPdp(ModemLog& log)
    {
        log.add(kPdpContextsRecord, pdpReport("TD-SCDMA", !_traffic.isIdle() && _traffic.isData()));
    }

    RecordWriter state() const
    {
        constexpr int kValid = 1;
        return RecordWriter(0xD0E0, 15)
            .set(u8(13), kValid)
            .set(u8(14), static_cast<std::int64_t>(rrcState(_traffic, _world)));
    }

    RecordWriter servingCell() const
    {
        return RecordWriter(0xD0E2, 26)
            .set(u8(14), _world.sites()[_serving.site()].abroad)
            .set(u8(15), cell().registrationArea)
            .set(u16(17), cell().uarfcn)
            .set(u16(19), cell().uarfcn)
            .set(u32(21), cell().identity)
            .set(u8(25).bit(0), 0);
    }

    // The serving cell first. The space between the header and the cells stays 0.
    RecordWriter neighborMeasurement()
    {
        enum Set { Active, Monitored, Detected };
        constexpr std::size_t kCells = 168, kCell = 16;
        auto near = _coverage.others(_serving.site(), kShownNeighbors, kDetectable);
        near.insert(near.begin(), _serving.site());
        RecordWriter record(0xD00A, kCells + kCell * near.size());
        record.set(u8(16).bits(1, 7), static_cast<std::int64_t>(near.size()));
        for (std::size_t i = 0; i < near.size(); ++i) {
            const TddCell heard = tddCell(_world, near[i]);
            const double power = _coverage.level(near[i]) + 0.8 * _random.normal();
            // The network's list ends after the sixth cell.
            const Set set = i == 0 ? Active : i < 6 ? Monitored : Detected;
            record.part(kCells + kCell * i, kCell)
                .set(u32(0).bits(0, 13), heard.uarfcn)
                .set(u32(0).bits(14, 20), heard.parameter)
                .set(u32(0).bits(21, 28), quantized(power, -115, 1, u32(0).bits(21, 28)))
                .set(u32(0).bits(29, 30), set)
                .set(u32(0).bit(31), i < 3);
        }
        return record;
    }

    RecordWriter gsmMeasurement() const
    {
        const auto near = _gsm.others(_world.sites().size(), kShownNeighbors, kGsmDetectable);
        RecordWriter record(0xD00E, 17 + 8 * near.size());
        record.set(u8(16), static_cast<std::int64_t>(near.size()));
        for (std::size_t i = 0; i < near.size(); ++i) {
            const GsmCell heard = gsmCell(_world, near[i]);
            record.part(17 + 8 * i, 8)
                .set(u16(0).bits(0, 13), heard.identity % 0x4000)
                .set(u16(0).bit(14), 0)
                .set(u16(0).bit(15), i < 4) // the other cells' synchronisation bursts were not read
                .set(u8(2), heard.bsic / 8)
                .set(u8(3), heard.bsic % 8)
                .set(u16(4), heard.arfcn)
                .set(u16(6), std::lround(_gsm.level(near[i])));
        }
        return record;
    }

    // Transport channels, and their composites with the signal-to-interference ratio in half dB per time slot. Empty
    // while the phone is not connected.
    RecordWriter linkQuality()
    {
        constexpr std::size_t kTransport = 2, kSlots = 6;
        const RrcState now = rrcState(_traffic, _world);
        const bool connected = now == RrcState::Dch || now == RrcState::Fach;
        const std::size_t channels = connected ? (now == RrcState::Dch ? 3 : 1) : 0;
        const std::size_t composites = connected ? (now == RrcState::Dch ? 2 : 1) : 0;
        const std::size_t first = 289 + 34 * channels;
        RecordWriter record(0xD00C, first + 8 * composites);
        record.set(u16(14).bits(6, 11), static_cast<std::int64_t>(channels))
            .set(u16(14).bits(12, 15), static_cast<std::int64_t>(composites));
        const double ratio = std::clamp(level() + 108, 1.0, 28.0); // dB
        for (std::size_t i = 0; i < channels; ++i)
            record.part(17 + kTransport * i, kTransport)
                .set(u8(0), static_cast<std::int64_t>(i) + 1)
                .set(u8(1), std::max(0, _random.whole(-6, 3) + (ratio < 8 ? 4 : 0)));
        for (std::size_t j = 0; j < composites; ++j) {
            auto composite = record.part(first + 8 * j, 8);
            composite.set(u8(0), static_cast<std::int64_t>(j) + 1).set(u8(1), 2 + 3 * static_cast<std::int64_t>(j));
            for (std::size_t slot = 0; slot < kSlots; ++slot)
                composite.part(2 + slot, 1).set(u8(0), quantized(ratio + _random.normal(), 0, 0.5, u8(0)));
        }
        return record;
    }

    Value cells()
    {
        auto serving = cellReport(kVoxCellTechnology_UTRAN2, kVoxCellType_Serving,
                                  {{std::string(kVoxCell_CellId), Value(cell().identity)},
                                   {std::string(kVoxCell_BandInfo), Value(kBand)},
                                   {std::string(kVoxCell_ScramblingCode), Value(cell().parameter)},
                                   {std::string(kVoxCell_UARFCN), Value(cell().uarfcn)}});
        if (std::exchange(_identified, true))
            serving->set(kVoxCell_LAC, cell().locationArea);
        auto all = makeArray({serving});
        for (const std::size_t site : _coverage.others(_serving.site(), kShownNeighbors, kDetectable)) {
            const auto power = static_cast<int>(std::lround(_coverage.level(site)));
            all->append(cellReport(kVoxCellTechnology_UTRAN2, kVoxCellType_Neighbor,
                                   {{std::string(kVoxCell_UARFCN), Value(tddCell(_world, site).uarfcn)},
                                    {std::string(kVoxCell_ScramblingCode), Value(tddCell(_world, site).parameter)},
                                    {std::string(kVoxCell_RSCP), Value(_random.chance(0.1) ? kNotMeasured : power)}}));
        }
        return all;
    }

    const World& _world;
    Random _random;
    Traffic _traffic;
    Coverage _coverage, _gsm;
    ServingCell _serving{kMargin, kPatience};
    bool _identified = false;
};

} // namespace

std::unique_ptr<Modem> makeUtranModem(const World& world, Random random)
{
    return std::make_unique<UtranModem>(world, random);
}

} // namespace kestrum
