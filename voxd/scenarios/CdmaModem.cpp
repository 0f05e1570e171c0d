#include "voxd/scenarios/CdmaModem.h"

#include "platform/TelephonyService.h"
#include "voxd/scenarios/Cells.h"
#include "voxd/scenarios/Coverage.h"
#include "voxd/scenarios/Traffic.h"

#include <algorithm>
#include <array>
#include <cmath>

namespace kestrum {
namespace {

// Periods in ticks. A frame takes 20 ms; the statistics' sequence numbers count seconds.
constexpr unsigned kEvdoStatus = 20, kPilots = 4, kFingers = 1, kOneXStatus = 4, kFrame = 2, kIdentityAgain = 500,
                   kStatistics = Modem::kSecond;

constexpr int kBandClass = 0, kOneXChannel = 283, kEvdoChannel = 37; // 800 MHz
constexpr Carrier kOneXPilot{878.5, 14}, kEvdoPilot{871.1, 14};
constexpr double kMargin = 2.5;    // dB
constexpr int kPatience = 5;       // moves
constexpr double kNoise = -104;    // dBm in 1.2288 MHz
constexpr double kSoftHandoff = 5; // dB below the best; stronger pilots are in the active set
constexpr std::size_t kActive = 4, kFingerCount = 6;
constexpr int kWarmUp = 15, kNegotiation = 20; // moves

// The pilots of one carrier: which of them serve, and how strong they are.
class Link {
public:
    Link(const World& world, Carrier carrier, double load, Random random)
        : _coverage(world, carrier, random), _load(load)
    {}

    bool follow()
    {
        _coverage.move();
        return _serving.follow(_coverage);
    }
    void camp()
    {
        _coverage.move();
        _serving.choose(_coverage.strongest());
    }
    std::size_t site() const { return _serving.site(); }
    double power() const { return dbm(_coverage.total() * _load + milliwatts(kNoise)); } ///< dBm received
    double strength(std::size_t site) const { return _coverage.level(site) - power(); }  ///< dB Ec/Io
    /// The serving pilot first. The others serve only while there is traffic.
    std::vector<std::size_t> active(bool traffic) const
    {
        std::vector<std::size_t> sites;
        if (traffic)
            sites = _coverage.others(site(), kActive - 1, _coverage.level(_coverage.strongest()) - kSoftHandoff);
        sites.insert(sites.begin(), site());
        return sites;
    }

private:
    Coverage _coverage;
    double _load; // a cell's power as a multiple of its pilot's power
    ServingCell _serving{kMargin, kPatience};
};

// The number of packets of one kind so far.
struct ForwardPackets {
    std::size_t counter;
    double bits;
    double reach; // dB Ec/Io; the kind is used from here upwards
    std::uint32_t sent;
};

class CdmaModem final : public Modem {
public:
    CdmaModem(const World& world, Random random)
        : _world(world),
          _random(random),
          _traffic(Random(_random.bits())),
          _oneX(world, kOneXPilot, 5, Random(_random.bits())),
          // EV-DO sends its pilot at full power, in bursts.
          _evdo(world, kEvdoPilot, 1.2, Random(_random.bits()))
    {}

    std::string_view technology() const override { return kVoxLogChannelTechnology_Zephra_CDMA; }
    std::vector<ScenarioCell> servingCells() const override
    {
        return {{"1x", cdmaCell(_world, _oneX.site()).baseStation}, {"EV-DO", cdmaCell(_world, _evdo.site()).pilot}};
    }

    void begin(ModemLog& log) override
    {
        _oneX.camp();
        _evdo.camp();
        _warmUp = kWarmUp;
        log.add(evdoStatus());
        log.add(oneXStatus());
        log.add(identity());
    }

    void move(ModemLog& log) override
    {
        _warmUp = std::max(_warmUp - 1, 0);
        _negotiation = std::max(_negotiation - 1, 0);
        const auto site = _evdo.site();
        const bool handoff = _oneX.follow();
        if (handoff) {
            log.add(oneXStatus());
            log.add(identity());
        }
        if (_evdo.follow()) {
            // Another colour code: the session moves, and the phone gets another address.
            if (colour(site) != colour(_evdo.site()))
                _negotiation = kNegotiation;
            log.add(evdoStatus());
            log.add(pilots());
        }
        if (_traffic.pass(kMoveSeconds)) {
            log.add(evdoStatus());
            log.add(oneXStatus());
        }
    }

    void tick(ModemLog& log, unsigned number) override
    {
        if (isDue(number, kEvdoStatus))
            log.add(evdoStatus());
        if (isDue(number, kPilots))
            log.add(pilots());
        if (isDue(number, kFingers))
            log.add(fingers());
        if (isDue(number, kOneXStatus))
            log.add(oneXStatus());
        if (onCall() && isDue(number, kFrame))
            log.add(frame());
        if (isDue(number, kIdentityAgain))
            log.add(identity());
        if (isDue(number, kStatistics)) {
            ++_second;
            transfer();
            log.add(forwardStatistics());
            log.add(reverseStatistics());
        }
    }

private:
    bool onCall() const { return _traffic.isActive() && _traffic.isVoice(); }
    bool onData() const { return _traffic.isActive() && _traffic.isData(); }
    int colour(std::size_t site) const
    {
        const Site& at = _world.sites()[site];
        return 40 + 20 * at.abroad + at.area;
    }
    /// Open loop power control: received and transmitted power add up to about -73 dBm (3GPP2 C.S0002).
    static double transmitPower(const Link& link) { return std::clamp(-73 - link.power(), -50.0, 24.0); }

    RecordWriter evdoStatus()
    {
        enum Device { Inactive, Acquisition, Sync, Idle, Access, Connected };
        enum Session { Closed, AmpSetup, Initiated, Negotiated, Open };
        const Device device = _warmUp > 10      ? Acquisition
                              : _warmUp > 5     ? Sync
                              : !onOrNearData() ? Idle
                              : onData()        ? Connected
                                                : Access;
        const Session session = _warmUp > 5         ? Closed
                                : _negotiation > 14 ? AmpSetup
                                : _negotiation > 7  ? Initiated
                                : _negotiation > 0  ? Negotiated
                                                    : Open;
        const auto received = std::lround(std::clamp(_evdo.power() + 0.4 * _random.normal(), -110.0, -20.0));
        const int address = (colour(_evdo.site()) << 16) + 0x2D71;
        return RecordWriter(0x1183, 50)
            .set(u16(13).bits(0, 10), kEvdoChannel)
            .set(u16(13).bits(11, 15), kBandClass)
            .set(u8(15), received)
            .set(u8(16), received - 2)
            .set(u8(17), std::lround(transmitPower(_evdo)))
            .set(u16(18), cdmaCell(_world, _evdo.site()).pilot)
            .set(u8(36), device)
            .set(u8(37), session)
            .set(u16(38), address & 0xFFFF)
            .set(u8(40), address >> 16)
            .set(u8(41), colour(_evdo.site()));
    }
    bool onOrNearData() const { return !_traffic.isIdle() && _traffic.isData(); }

    /// A ratio in units of 1/512; at least 1.
    static std::int64_t parts(double decibels) { return std::max(std::llround(512 * milliwatts(decibels)), 1LL); }

    RecordWriter pilots() const
    {
        const auto active = _evdo.active(onData());
        RecordWriter record(0x12B6, 25 + 12 * active.size());
        record.set(u8(15), static_cast<std::int64_t>(active.size()));
        for (std::size_t i = 0; i < active.size(); ++i)
            record.part(25 + 12 * i, 12)
                .set(u16(0), cdmaCell(_world, active[i]).pilot)
                .set(u16(2), parts(_evdo.strength(active[i])));
        return record;
    }

    // Each active pilot has one finger on its first path. The serving pilot has a second finger on an echo.
    RecordWriter fingers()
    {
        constexpr int kUnused = 0xFFFF;
        auto paths = _evdo.active(onData());
        const std::size_t echo = paths.size();
        paths.push_back(_evdo.site());
        RecordWriter record(0x108A, 23 + 14 * kFingerCount);
        record.set(u8(22), kFingerCount);
        for (std::size_t i = 0; i < kFingerCount; ++i) {
            auto finger = record.part(23 + 14 * i, 14);
            if (i < paths.size())
                finger.set(u16(0), cdmaCell(_world, paths[i]).pilot)
                    .set(u16(6), parts(_evdo.strength(paths[i]) - (i == echo ? 6 : 0) + 0.5 * _random.normal()));
            else
                finger.set(u16(0), kUnused);
        }
        return record;
    }

    RecordWriter oneXStatus()
    {
        enum Device { Acquisition = 3, Sync = 4, Paging = 6, Sleep = 7, Traffic = 8 };
        constexpr std::size_t kState = 17, kRadio = kState + 8, kActiveSet = kRadio + 16;
        const auto active = _oneX.active(onCall());
        // An entry for one path, rounded up to words.
        constexpr std::size_t kPaths = 1, kEntry = (6 * kPaths + 15) / 4 * 4, kEnergy = 12 + 4 * kPaths;
        const std::size_t activeSize = 12 + kEntry * active.size(), fingers = kActiveSet + activeSize;
        constexpr std::size_t kFingerSize = 12;
        RecordWriter record(0x119C, fingers + kFingerSize);
        record.set(u8(13), 1).set(u8(14), 4);

        // The idle phone wakes up every 1.28 s to listen for a page.
        const bool awake = !_traffic.isIdle() || _random.chance(0.2);
        const Device device = _warmUp > 10  ? Acquisition
                              : _warmUp > 5 ? Sync
                              : onCall()    ? Traffic
                              : awake       ? Paging
                                            : Sleep;
        record.part(kState, 8).set(u8(0), 1).set(u16(2), 8).set(u8(4), device);

        const auto agc = [&](double power) { return std::lround(std::clamp((power + 63.248) / 0.334, -128.0, 127.0)); };
        record.part(kRadio, 16)
            .set(u8(0), 2)
            .set(u16(2), 16)
            .set(u8(4), kBandClass)
            .set(u8(5), kBandClass)
            .set(u16(6), kOneXChannel)
            .set(u16(8), kOneXChannel)
            .set(u8(10), agc(_oneX.power() + 0.4 * _random.normal()))
            .set(u8(11), agc(_oneX.power() - 2 + 0.4 * _random.normal()))
            .set(u16(12), std::lround(10 * transmitPower(_oneX)));

        // Energies are integrated over `kChips`; a part of 1 / kChips of each is noise.
        constexpr int kChips = 64, kGain = 1, kScale = 2;
        auto set = record.part(kActiveSet, activeSize);
        set.set(u8(0), 3)
            .set(u16(2), static_cast<std::int64_t>(activeSize))
            .set(u16(4), kChips)
            .set(u8(6), kGain)
            .set(u8(7), kScale)
            .set(u8(8), static_cast<std::int64_t>(active.size()))
            .set(u8(9), kPaths)
            .set(u16(10), cdmaCell(_world, active.front()).pilot);
        for (std::size_t i = 0; i < active.size(); ++i) {
            const double ratio = milliwatts(_oneX.strength(active[i])) + 1.0 / kChips;
            auto pilot = set.part(12 + kEntry * i, kEntry);
            pilot.set(u16(0), cdmaCell(_world, active[i]).pilot);
            pilot.part(kEnergy, 2)
                .set(u16(0), std::llround(ratio * kGain * 9 * kChips * kChips / std::exp2(2 * kScale - 3)));
        }

        record.part(fingers, kFingerSize).set(u8(0), 4).set(u16(2), kFingerSize);
        return record;
    }

    // One frame of 20 ms. Bad frames are frequent where the pilot is weak.
    RecordWriter frame()
    {
        constexpr std::size_t kDemodulation = 28;
        const double errorRate = std::clamp(0.004 + 0.004 * (-11 - _oneX.strength(_oneX.site())), 0.004, 0.08);
        RecordWriter record(0x119D, 17 + kDemodulation);
        record.set(u8(13), 1).set(u8(14), 1);
        record.part(17, kDemodulation).set(u8(0), 11).set(u16(2), kDemodulation).set(u8(24), _random.chance(errorRate));
        return record;
    }

    RecordWriter identity() const
    {
        constexpr int kHome = 0, kRoaming = 1, kCdma = 2, kRevision = 6;
        const CdmaCell cell = cdmaCell(_world, _oneX.site());
        // The modem's length, because the base station comes after all other fields.
        return RecordWriter(0x134F, 186)
            .set(u8(13), 2)
            .set(u32(42), _world.sites()[_oneX.site()].abroad ? kRoaming : kHome)
            .set(u32(46), kCdma)
            .set(u16(50), cell.system)
            .set(u16(52), cell.network)
            .set(u8(131), cell.packetZone)
            .set(u8(133), kRevision)
            .set(u16(184), cell.baseStation);
    }

    // The packets of the last second. The pilot's strength limits what the link carries.
    void transfer()
    {
        if (!onData())
            return;
        const double strength = _evdo.strength(_evdo.site());
        const double forward = 2457600 * std::clamp(milliwatts(strength), 0.05, 1.0) * _traffic.load();
        auto best = std::ranges::find_if(_forward, [&](const auto& kind) { return strength >= kind.reach; });
        if (best == _forward.end())
            --best;
        best->sent += static_cast<std::uint32_t>(forward / best->bits);

        // Packets are longer while the phone needs little power. Most need only the first of four attempts.
        constexpr std::array<double, kRates> kBits{128, 256, 512, 768, 1024, 1536, 2048, 3072, 4096, 6144, 8192, 12288};
        const double room = std::clamp((24 - transmitPower(_evdo)) / 40, 0.1, 0.9);
        const auto rate = static_cast<std::size_t>(room * kRates);
        const auto packets = static_cast<std::uint32_t>(forward / 4 / kBits[rate]);
        const std::uint32_t again = packets / 6;
        _reverse[rate][0] += packets - again;
        _reverse[rate][1] += again;
    }

    RecordWriter forwardStatistics() const
    {
        RecordWriter record(0x1192, 241);
        record.set(u32(13), _second);
        for (const auto& kind : _forward)
            record.part(17 + 4 * kind.counter, 4).set(u32(0), kind.sent);
        return record;
    }

    RecordWriter reverseStatistics() const
    {
        RecordWriter record(0x127E, 1750);
        record.set(u32(14), _second);
        for (std::size_t rate = 0; rate < kRates; ++rate)
            for (std::size_t attempt = 0; attempt < kAttempts; ++attempt)
                record.part(18 + 24 * rate + 4 * attempt, 4).set(u32(0), _reverse[rate][attempt]);
        return record;
    }

    static constexpr std::size_t kRates = 12, kAttempts = 4;

    const World& _world;
    Random _random;
    Traffic _traffic;
    Link _oneX, _evdo;
    int _warmUp = kWarmUp; // moves until the phone is in service
    int _negotiation = 0;  // moves until the session is open again
    std::uint32_t _second = 0;
    // Packets of 5120, 4096, 3072, 2048 and 1024 bits that take one or a few slots, the longest first.
    std::array<ForwardPackets, 5> _forward{
        {{52, 5120, -1.5, 0}, {45, 4096, -3, 0}, {39, 3072, -5, 0}, {27, 2048, -7, 0}, {3, 1024, -99, 0}}};
    std::array<std::array<std::uint32_t, kAttempts>, kRates> _reverse{}; // by rate and attempt
};

} // namespace

std::unique_ptr<Modem> makeCdmaModem(const World& world, Random random)
{
    return std::make_unique<CdmaModem>(world, random);
}

} // namespace kestrum
