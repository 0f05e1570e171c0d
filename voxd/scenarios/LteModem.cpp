#include "voxd/scenarios/LteModem.h"

#include "platform/TelephonyService.h"
#include "voxd/scenarios/Cells.h"
#include "voxd/scenarios/Coverage.h"
#include "voxd/scenarios/TelephonyReports.h"
#include "voxd/scenarios/Traffic.h"

#include <algorithm>
#include <cmath>

namespace kestrum {
namespace {

// Periods of repeated records, in ticks.
constexpr unsigned kServingIdle = 2, kServingConnected = 20, kIdentityAgain = 200, kOtherCarrier = 5, kCandidates = 8,
                   kCellMonitor = 100, kPdpAgain = 1000, kSimAgain = 3000;

constexpr double kMargin = 3;            // dB; a stronger cell becomes the serving cell
constexpr int kPatience = 8;             // moves
constexpr double kLeaveLayer = -104;     // dBm; below it the lower band is used
constexpr double kReturnToLayer = -98;   // dBm
constexpr double kDetectable = -124;     // dBm
constexpr double kLowestQuality = -19.5; // dB RSRQ
constexpr double kQrxlevmin = -124;      // dBm (3GPP TS 36.304)
constexpr double kNoise = -123;          // dBm in a resource element
constexpr double kWeakServing = -112;    // dBm; below it other radio access becomes a candidate
constexpr std::size_t kShownNeighbors = 6, kShownDetected = 3;
constexpr int kAbsent6 = 32, kAbsent7 = 64; // "not present" in fields of 6 and 7 bits

class LteModem final : public Modem {
public:
    LteModem(const World& world, Random random) : _world(world), _random(random), _traffic(Random(_random.bits()))
    {
        for (const auto& layer : lteLayers())
            _coverages.emplace_back(world, layer.carrier, Random(_random.bits()));
    }

    std::string_view technology() const override { return kVoxLogChannelTechnology_Zephra_LTE; }
    std::vector<ScenarioCell> servingCells() const override { return {{"LTE", cell().identity}}; }

    void begin(ModemLog& log) override
    {
        receive();
        camp(0);
        if (level() < kLeaveLayer)
            camp(1);
        logServingCell(log);
        logSim(log);
        logPdp(log);
    }

    void move(ModemLog& log) override
    {
        receive();
        const auto [layer, site] = std::pair(_layer, _serving.site());
        if (_layer == 0 && level() < kLeaveLayer)
            camp(1);
        else if (_layer == 1 && _coverages[0].level(_coverages[0].strongest()) > kReturnToLayer)
            camp(0);
        else
            _serving.follow(coverage());
        if (_layer != layer || _serving.site() != site)
            logServingCell(log);
        if (_world.sites()[site].area != _world.sites()[_serving.site()].area ||
            _world.sites()[site].abroad != _world.sites()[_serving.site()].abroad)
            logSim(log);
        if (_traffic.pass(kMoveSeconds))
            logPdp(log);
        _load = std::clamp(_load + 0.03 * _random.normal(), 0.1, 1.0);
    }

    void tick(ModemLog& log, unsigned number) override
    {
        if (_traffic.isIdle()) {
            if (isDue(number, kServingIdle))
                log.add(servingMeasurement());
            log.add(neighborMeasurement(_layer));
            if (isDue(number, kOtherCarrier))
                log.add(neighborMeasurement(1 - _layer));
            if (isDue(number, kCandidates))
                log.add(candidates());
        } else {
            if (isDue(number, kServingConnected))
                log.add(servingMeasurement());
            log.add(connectedMeasurement());
        }
        if (isDue(number, kIdentityAgain)) {
            log.add(servingCell());
            log.add(antennas());
        }
        if (isDue(number, kCellMonitor))
            log.add(kCellMonitorRecord, cells());
        if (isDue(number, kPdpAgain))
            logPdp(log);
        if (isDue(number, kSimAgain))
            logSim(log);
    }

private:
    // The average measurement of a cell.
    struct Quality {
        double power, quality, indicator; // dBm RSRP, dB RSRQ, dBm RSSI (3GPP TS 36.214)
    };
    Quality quality(std::size_t layer, std::size_t site) const
    {
        // A resource block has 12 elements per symbol. 2 always carry reference signals, the others depend on the
        // load.
        const auto& coverage = _coverages[layer];
        const double block = coverage.total() * (2 + 10 * _load) + 12 * milliwatts(kNoise);
        const double power = coverage.level(site);
        return {power, inRange(power - dbm(block)), dbm(block * lteLayers()[layer].resourceBlocks)};
    }
    // RSRQ is reported from -19.5 to -3 dB (3GPP TS 36.133).
    static double inRange(double quality) { return std::clamp(quality, kLowestQuality, -3.0); }
    /// The cells that stand out from the interference.
    std::vector<std::size_t> neighbors(std::size_t on) const
    {
        const std::size_t none = _world.sites().size();
        auto near = _coverages[on].others(on == _layer ? _serving.site() : none, kShownNeighbors, kDetectable);
        std::erase_if(near, [&](std::size_t site) { return quality(on, site).quality <= kLowestQuality; });
        return near;
    }
    /// The average plus the error of a single measurement.
    double measured(double average) { return average + 0.9 * _random.normal(); }
    double measuredQuality(double average) { return inRange(measured(average)); }

    void receive()
    {
        for (auto& each : _coverages)
            each.move();
    }
    void camp(std::size_t layer)
    {
        _layer = layer;
        _serving.choose(coverage().strongest());
        _identified = false;
    }
    const Coverage& coverage() const { return _coverages[_layer]; }
    const LteLayer& layer() const { return lteLayers()[_layer]; }
    double level() const { return coverage().level(_serving.site()); }
    LteCell cell() const { return lteCell(_world, _layer, _serving.site()); }

    void logServingCell(ModemLog& log)
    {
        // The phone has not read its system information yet.
        _identified = false;
        _rulesUpdated = true;
        log.add(servingCell());
        log.add(antennas());
        log.add(servingMeasurement());
        log.add(kCellMonitorRecord, cells());
    }
    void logSim(ModemLog& log)
    {
        const auto at = gsmCell(_world, _serving.site());
        log.add(kSimFilesRecord, simReport(_world.plmn(_serving.site()), at.locationArea, at.routingArea));
    }
    void logPdp(ModemLog& log)
    {
        log.add(kPdpContextsRecord, pdpReport("LTE", !_traffic.isIdle() && _traffic.isData()));
    }

    RecordWriter antennas() const { return RecordWriter(0xB0C1, 22).set(u8(13), 2).set(u8(20), _layer == 0 ? 4 : 2); }

    RecordWriter servingCell() const
    {
        const Plmn& plmn = _world.plmn(_serving.site());
        return RecordWriter(0xB0C2, 38)
            .set(u8(13), 2)
            .set(u16(14), cell().physicalId)
            .set(u16(16), layer().earfcn)
            .set(u16(18), layer().uplinkEarfcn)
            .set(u8(20), layer().resourceBlocks)
            .set(u8(21), layer().resourceBlocks)
            .set(u32(22), cell().identity)
            .set(u16(26), cell().trackingArea)
            .set(u32(28), layer().band)
            .set(u16(32), plmn.mcc)
            .set(u8(34), plmn.mncDigits)
            .set(u16(35), plmn.mnc);
    }

    RecordWriter servingMeasurement()
    {
        const Quality average = quality(_layer, _serving.site());
        const bool weak = average.power < kQrxlevmin;
        _cyclesBelow = weak ? std::min(_cyclesBelow + 1, 63) : 0;
        return RecordWriter(0xB17F, 33)
            .set(u8(13), 1)
            .set(u16(17), layer().earfcn)
            .set(u16(19).bits(0, 8), cell().physicalId)
            .set(u16(19).bits(9, 12), layer().priority)
            .set(u32(21).bits(0, 8), quarters(measured(average.power), -140, u32(21).bits(0, 8)))
            .set(u32(21).bits(9, 17), quarters(average.power, -140, u32(21).bits(9, 17)))
            .set(u32(21).bits(18, 24), quarters(measuredQuality(average.quality), -30, u32(21).bits(18, 24)))
            .set(u32(21).bits(25, 31), quarters(average.quality, -30, u32(21).bits(25, 31)))
            .set(u32(25).bits(0, 8), quantized(measured(average.indicator), -140, 0.5, u32(25).bits(0, 8)))
            .set(u32(25).bits(9, 14), quantized(kQrxlevmin, -140, 2, u32(25).bits(9, 14)))
            .set(u32(25).bits(15, 21), _layer == 0 ? 23 + 30 : kAbsent7)
            .set(u32(25).bits(22, 27), 23 + 30)
            .set(u32(29).bits(0, 6), quantized(average.power - kQrxlevmin, -30, 1, u32(29).bits(0, 6)))
            .set(u32(29).bits(7, 12), _cyclesBelow)
            .set(u32(29).bits(13, 18), _layer == 0 ? 31 : kAbsent6)
            .set(u32(29).bits(19, 24), 5)
            .set(u32(29).bit(25), std::exchange(_rulesUpdated, false))
            .set(u32(29).bits(26, 29), _layer == 0 ? 1 : 3);
    }

    RecordWriter connectedMeasurement()
    {
        const auto near = neighbors(_layer);
        // The weakest cells were detected, but not measured yet.
        const std::size_t detected = std::min(near.size() / 2, kShownDetected), reported = near.size() - detected;
        const Quality serving = quality(_layer, _serving.site());
        RecordWriter record(0xB179, 29 + 6 * reported + 2 * detected);
        record.set(u8(13), 4)
            .set(u16(17), layer().earfcn)
            .set(u16(19), cell().physicalId)
            .set(u16(21), _random.whole(0, 1023) * 10 + _random.whole(0, 9))
            .set(u16(23), quarters(measured(serving.power), -140, u16(23)))
            .set(u16(25), quantized(measuredQuality(serving.quality), -20, 0.125, u16(25)))
            .set(u8(27), static_cast<std::int64_t>(reported))
            .set(u8(28), static_cast<std::int64_t>(detected));
        for (std::size_t i = 0; i < reported; ++i) {
            const Quality heard = quality(_layer, near[i]);
            record.part(29 + 6 * i, 6)
                .set(u16(0), lteCell(_world, _layer, near[i]).physicalId)
                .set(u16(2), quarters(measured(heard.power), -140, u16(2)))
                .set(u16(4), quantized(measuredQuality(heard.quality), -20, 0.125, u16(4)));
        }
        for (std::size_t i = 0; i < detected; ++i)
            record.part(29 + 6 * reported + 2 * i, 2)
                .set(u16(0), lteCell(_world, _layer, near[reported + i]).physicalId);
        return record;
    }

    RecordWriter neighborMeasurement(std::size_t on)
    {
        // A record holds at least one cell: the strongest is always included.
        const auto order = _coverages[on].order();
        const auto near = neighbors(on);
        const std::size_t count = std::max<std::size_t>(near.size(), 1);
        RecordWriter record(0xB180, 21 + 20 * count);
        record.set(u8(13), 2)
            .set(u16(17), lteLayers()[on].earfcn)
            .set(u16(19).bits(0, 5), quantized(kQrxlevmin, -140, 2, u16(19).bits(0, 5)))
            .set(u16(19).bits(6, 10), static_cast<std::int64_t>(count) - 1);
        for (std::size_t i = 0; i < count; ++i) {
            const std::size_t site = near.empty() ? order[on == _layer && order[0] == _serving.site()] : near[i];
            const Quality heard = quality(on, site);
            // The cells' frames are shifted against each other, because the sites' clocks are.
            const auto shift = static_cast<std::int64_t>(site);
            record.part(21 + 20 * i, 20)
                .set(u32(0).bits(0, 8), lteCell(_world, on, site).physicalId)
                .set(u32(0).bits(9, 16), quantized(measured(heard.indicator), -140, 0.5, u32(0).bits(9, 16)))
                .set(u32(0).bits(17, 25), quantized(measured(heard.power), -140, 0.5, u32(0).bits(17, 25)))
                .set(u16(4).bits(0, 8), quantized(heard.power, -140, 0.5, u16(4).bits(0, 8)))
                .set(u16(4).bits(9, 15), quarters(measuredQuality(heard.quality), -30, u16(4).bits(9, 15)))
                .set(u16(6).bits(0, 6), quarters(heard.quality, -30, u16(6).bits(0, 6)))
                .set(u16(6).bits(7, 13), quantized(heard.power - kQrxlevmin, -30, 1, u16(6).bits(7, 13)))
                .set(u16(8), _random.whole(0, 180))
                .set(u32(12).bits(0, 10), 23 * shift % 1024)
                .set(u32(12).bits(11, 29), 7919 * shift % 307200 + _random.whole(0, 3));
        }
        return record;
    }

    // Only the best candidate. Elements stand 4 bytes apart though each is longer, so the first one's frequency and
    // cell would be read from the second one's header.
    RecordWriter candidates()
    {
        enum RadioAccess { Lte, Utran, Geran };
        constexpr std::size_t kElement = 21;
        const std::size_t site = coverage().strongest();
        const bool better = site != _serving.site(), weak = level() < kWeakServing;
        const bool other = !better && _layer == 1 && _coverages[0].level(_coverages[0].strongest()) > kDetectable;
        RecordWriter record(0xB186, kElement + 12);
        record.set(u8(13), 1)
            .set(u16(15), layer().earfcn)
            .set(u16(17), cell().physicalId)
            .set(u16(19), better || other || weak);
        auto candidate = record.part(kElement, 12);
        if (better || other) {
            const std::size_t on = better ? _layer : 0;
            candidate.set(u16(0), lteLayers()[on].priority)
                .set(u16(2), Lte)
                .set(u16(4), lteLayers()[on].earfcn)
                .set(u16(6).bits(7, 15), lteCell(_world, on, _coverages[on].strongest()).physicalId);
        } else if (weak && _world.sites()[site].town) {
            const UmtsCell umts = umtsCell(_world, site);
            candidate.set(u16(0), 2).set(u16(2), Utran).set(u16(4), umts.uarfcn).set(u16(6), umts.scramblingCode);
        } else if (weak) {
            const GsmCell gsm = gsmCell(_world, site);
            candidate.set(u16(0), 1).set(u16(2), Geran).set(u16(4), gsm.arfcn).set(u8(7), gsm.bsic);
        }
        return record;
    }

    Value cells()
    {
        const Plmn& plmn = _world.plmn(_serving.site());
        auto serving = cellReport(kVoxCellTechnology_LTE, kVoxCellType_Serving,
                                  {{std::string(kVoxCell_MCC), Value(plmn.mcc)},
                                   {std::string(kVoxCell_MNC), Value(plmn.mnc)},
                                   {std::string(kVoxCell_CellId), Value(cell().identity)},
                                   {std::string(kVoxCell_PhysicalCellId), Value(cell().physicalId)},
                                   {std::string(kVoxCell_BandInfo), Value(layer().band)},
                                   {std::string(kVoxCell_UARFCN), Value(layer().earfcn)}});
        if (std::exchange(_identified, true))
            serving->set(kVoxCell_TAC, cell().trackingArea);
        auto all = makeArray({serving});
        for (const std::size_t site : neighbors(_layer))
            all->append(
                cellReport(kVoxCellTechnology_LTE, kVoxCellType_Neighbor,
                           {{std::string(kVoxCell_PhysicalCellId), Value(lteCell(_world, _layer, site).physicalId)},
                            {std::string(kVoxCell_UARFCN), Value(layer().earfcn)}}));
        return all;
    }

    static std::int64_t quarters(double value, double lowest, Field field)
    {
        return quantized(value, lowest, 0.25, field);
    }

    const World& _world;
    Random _random;
    Traffic _traffic;
    std::vector<Coverage> _coverages; // by layer
    std::size_t _layer = 0;
    ServingCell _serving{kMargin, kPatience};
    double _load = 0.5; // of the cells, 0 to 1
    bool _identified = false, _rulesUpdated = true;
    int _cyclesBelow = 0;
};

} // namespace

std::unique_ptr<Modem> makeLteModem(const World& world, Random random)
{
    return std::make_unique<LteModem>(world, random);
}

} // namespace kestrum
