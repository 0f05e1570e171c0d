#include "voxd/scenarios/GsmModem.h"

#include "platform/TelephonyService.h"
#include "voxd/scenarios/GeranRadio.h"
#include "voxd/scenarios/TelephonyReports.h"
#include "voxd/scenarios/Traffic.h"
#include "voxd/scenarios/UtraRadio.h"

namespace kestrum {
namespace {

// Periods in ticks.
constexpr unsigned kStatesAgain = 100, kPlmnAgain = 200, kCellMonitor = 100, kPdpAgain = 1000, kSimAgain = 3000;

constexpr double kLeaveUmts = -101, kReturnToUmts = -95; // dBm RSCP
constexpr int kRadioPatience = 12;                       // moves
constexpr int kUpdate = 10;                              // moves; the duration of a location update

// Equivalent networks, one digit per byte. MCC and MNC digits alternate; the second network's digits begin at the
// fourth byte. At home 001-99 and 999-102, abroad 001-01.
constexpr int kEquivalentAtHome[] = {0, 0, 0, 9, 1, 9, 0, 9, 2};
constexpr int kEquivalentAbroad[] = {0, 0, 0, 0, 1, 1};

class GsmModem final : public Modem {
public:
    GsmModem(const World& world, Random random)
        : _world(world),
          _random(random),
          _traffic(Random(_random.bits())),
          _umts(world, Random(_random.bits())),
          _gsm(world, Random(_random.bits()))
    {}

    std::string_view technology() const override { return kVoxLogChannelTechnology_Zephra_GSM; }
    std::vector<ScenarioCell> servingCells() const override
    {
        if (_onUmts)
            return {{"UMTS", _umts.cell().identity}};
        return {{"GSM", _gsm.cell().identity}};
    }

    void begin(ModemLog& log) override
    {
        receive();
        _onUmts = _umts.best() > kLeaveUmts;
        camp(log);
        logSim(log);
        logPdp(log);
    }

    void move(ModemLog& log) override
    {
        receive();
        const Site before = _world.sites()[site()];
        if (radioChanges())
            changeRadio(log);
        else if (_onUmts ? _umts.follow() : _gsm.follow())
            logServingCell(log);
        const Site& now = _world.sites()[site()];
        if (before.abroad != now.abroad || before.area != now.area)
            beginUpdate(log);
        else if (_update > 0 && --_update == 0)
            endUpdate(log);
        if (_traffic.pass(kMoveSeconds)) {
            logStates(log);
            if (_traffic.isData() && (_traffic.phase() == Traffic::Phase::Setup || _traffic.isIdle()))
                logPdp(log);
        }
    }

    void tick(ModemLog& log, unsigned number) override
    {
        if (_onUmts)
            _umts.tick(log, number, _traffic);
        else
            _gsm.tick(log, number, _traffic);
        if (isDue(number, kStatesAgain))
            logMobility(log);
        if (isDue(number, kPlmnAgain))
            logPlmn(log);
        if (isDue(number, kCellMonitor))
            log.add(kCellMonitorRecord, cells());
        if (isDue(number, kPdpAgain))
            logPdp(log);
        if (isDue(number, kSimAgain))
            logSim(log);
    }

private:
    std::size_t site() const { return _onUmts ? _umts.site() : _gsm.site(); }
    GsmCell area() const { return gsmCell(_world, site()); } // the site defines the area

    void receive()
    {
        _umts.receive();
        _gsm.receive();
    }

    // UMTS is preferred to GSM until it has been too weak for some moves.
    bool radioChanges()
    {
        const bool wrong = _onUmts ? _umts.best() < kLeaveUmts : _umts.best() > kReturnToUmts;
        _otherRadio = wrong ? _otherRadio + 1 : 0;
        return _otherRadio >= kRadioPatience;
    }

    void changeRadio(ModemLog& log)
    {
        log.add(_gsm.state(_onUmts ? GeranRadio::FromUmts : GeranRadio::ToUmts, _traffic.isData()));
        _onUmts = !_onUmts;
        camp(log);
    }

    void camp(ModemLog& log)
    {
        _otherRadio = 0;
        if (_onUmts)
            _umts.camp();
        else
            _gsm.camp();
        logServingCell(log);
        if (_onUmts)
            log.add(_gsm.state(GeranRadio::Inactive, false));
        else
            _umts.logState(log, nullptr);
        logStates(log);
    }

    void logServingCell(ModemLog& log)
    {
        if (_onUmts)
            _umts.logServingCell(log);
        else
            _gsm.logServingCell(log, _traffic);
        logPlmn(log);
        // The phone has not read its system information yet.
        _identified = false;
        log.add(kCellMonitorRecord, cells());
    }

    void logStates(ModemLog& log)
    {
        if (_onUmts)
            _umts.logState(log, &_traffic);
        else
            _gsm.logState(log, _traffic);
        logMobility(log);
    }

    void beginUpdate(ModemLog& log)
    {
        _update = kUpdate;
        logMobility(log);
    }
    void endUpdate(ModemLog& log)
    {
        logMobility(log);
        logSim(log);
    }

    // Mobility management for calls (0x7131) and packets (0x7130), and the registration (0x7132).
    void logMobility(ModemLog& log)
    {
        constexpr int kIdle = 19, kUpdateInitiated = 3, kWaitForConnection = 14, kConnectionActive = 6,
                      kWaitForCommand = 9;
        constexpr int kOfPhase[] = {kIdle, kWaitForConnection, kConnectionActive, kWaitForCommand};
        constexpr int kAttemptingToUpdate = 4, kNormalService = 8, kUpdated = 0, kNotUpdated = 1;
        const bool updating = _update > 0;
        const bool voice = !_traffic.isIdle() && _traffic.isVoice();
        const int phase = voice ? kOfPhase[static_cast<std::size_t>(_traffic.phase())] : kIdle;
        log.add(RecordWriter(0x7131, 16)
                    .set(u8(13), voice      ? phase
                                 : updating ? kUpdateInitiated
                                            : kIdle)
                    .set(u8(14), updating ? kAttemptingToUpdate : kNormalService)
                    .set(u8(15), updating ? kNotUpdated : kUpdated));

        constexpr int kRegistered = 3, kAreaUpdate = 5, kServiceRequest = 6;
        constexpr int kPacketNormal = 0, kUpdateNeeded = 8;
        const bool asking = _traffic.isData() && _traffic.phase() == Traffic::Phase::Setup;
        log.add(RecordWriter(0x7130, 16)
                    .set(u8(13), updating ? kAreaUpdate
                                 : asking ? kServiceRequest
                                          : kRegistered)
                    .set(u8(14), updating ? kUpdateNeeded : kPacketNormal)
                    .set(u8(15), updating ? kNotUpdated : kUpdated));

        constexpr int kRegistrationIdle = 1, kRegistering = 2, kAutomatic = 0;
        log.add(
            RecordWriter(0x7132, 16).set(u8(13), updating ? kRegistering : kRegistrationIdle).set(u8(14), kAutomatic));
    }

    void logPlmn(ModemLog& log)
    {
        constexpr int kModeOne = 0, kModeTwo = 1, kCallsAndPackets = 3;
        const bool abroad = _world.sites()[site()].abroad;
        const auto octets = plmnOctets(_world.plmn(site()));
        log.add(RecordWriter(0x7135, 32)
                    .set(u8(13), abroad ? kModeTwo : kModeOne)
                    .set(u8(14), kCallsAndPackets)
                    .set(u8(15), octets[0])
                    .set(u8(16), octets[1])
                    .set(u8(17), octets[2])
                    .set(u16BigEndian(18), area().locationArea)
                    .set(u8(20), area().routingArea));

        const std::span<const int> digits = abroad ? std::span<const int>(kEquivalentAbroad) : kEquivalentAtHome;
        RecordWriter equivalent(0x7150, 17 + digits.size());
        equivalent.set(u8(16), static_cast<std::int64_t>(digits.size() / 3) - 1);
        for (std::size_t i = 0; i < digits.size(); ++i)
            equivalent.part(17 + i, 1).set(u8(0), digits[i]);
        log.add(std::move(equivalent));
    }

    void logSim(ModemLog& log)
    {
        log.add(kSimFilesRecord, simReport(_world.plmn(site()), area().locationArea, area().routingArea));
    }
    void logPdp(ModemLog& log)
    {
        log.add(kPdpContextsRecord, pdpReport(_onUmts ? "UMTS" : "GSM", !_traffic.isIdle() && _traffic.isData()));
    }

    Value cells()
    {
        const Plmn& plmn = _world.plmn(site());
        auto serving = _onUmts ? _umts.servingReport() : _gsm.servingReport();
        serving->set(kVoxCell_MCC, plmn.mcc);
        serving->set(kVoxCell_MNC, plmn.mnc);
        if (std::exchange(_identified, true))
            serving->set(kVoxCell_LAC, area().locationArea);
        auto all = makeArray({serving});
        _umts.reportNeighbors(*all);
        _gsm.reportNeighbors(*all);
        return all;
    }

    const World& _world;
    Random _random;
    Traffic _traffic;
    UtraRadio _umts;
    GeranRadio _gsm;
    bool _onUmts = true, _identified = false;
    int _otherRadio = 0; // moves for which the other radio was better
    int _update = 0;     // moves until the location update ends
};

} // namespace

std::unique_ptr<Modem> makeGsmModem(const World& world, Random random)
{
    return std::make_unique<GsmModem>(world, random);
}

} // namespace kestrum
