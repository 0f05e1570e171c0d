#include "voxd/modem/WatchedModem.h"

#include "platform/SystemLog.h"
#include "voxd/modem/BusNames.h"

#include <QDBusArgument>

#include <algorithm>
#include <array>
#include <utility>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using std::chrono::seconds;

// The daemon measures levels every second.
constexpr std::uint32_t kRate = 1;
// MM_MODEM_LOCATION_SOURCE_3GPP_LAC_CI: a bit of the sources, and the key of what they found.
constexpr std::uint32_t kLacCi = 1;

constexpr seconds kCallLimit = 10s;
constexpr seconds kLocationInterval = 2s, kCellsInterval = 5s;
// GetCellInfo can take the daemon 300 s. What it found then is of the past, but the daemon is asked one at a time.
constexpr seconds kCellsLimit = 20s, kCellsEnd = 310s;
const QString kSetup = QStringLiteral("Setup");
// Before a service that failed is asked again.
constexpr seconds kPause = 60s;

// Far more than a modem sees. The tree shows the strongest.
constexpr qsizetype kMostCells = 1024, kMostBearers = 16;
constexpr std::uint32_t kWhole = 100; // percent

constexpr std::string_view nameOf(ModemService service)
{
    switch (service) {
    case ModemService::Signal:
        return "signal";
    case ModemService::Location:
        return "location";
    case ModemService::CellInformation:
        return "cell information";
    case ModemService::Sim:
        return "SIM";
    case ModemService::Data:
        return "data";
    }
    return "";
}

std::string wordsFor(const ModemRefusal& refusal)
{
    switch (refusal.reason) {
    case RefusalReason::NotPermitted:
        return "not permitted; see voxd(1)";
    case RefusalReason::NotSupported:
        return "not supported";
    case RefusalReason::NoAnswer:
        return "no answer";
    case RefusalReason::Failed:
        break;
    }
    return refusal.text;
}

RefusalReason reasonOf(const QString& error)
{
    struct Known {
        QLatin1String ending;
        RefusalReason reason;
    };
    static constexpr std::array kKnown{
        Known{QLatin1String("DBus.Error.AccessDenied"), RefusalReason::NotPermitted},
        Known{QLatin1String("ModemManager1.Error.Core.Unauthorized"), RefusalReason::NotPermitted},
        Known{QLatin1String("ModemManager1.Error.Core.Unsupported"), RefusalReason::NotSupported},
        Known{QLatin1String("DBus.Error.UnknownMethod"), RefusalReason::NotSupported},
        Known{QLatin1String("DBus.Error.UnknownInterface"), RefusalReason::NotSupported},
        Known{QLatin1String("DBus.Error.NoReply"), RefusalReason::NoAnswer},
        Known{QLatin1String("DBus.Error.Timeout"), RefusalReason::NoAnswer},
        Known{QLatin1String("DBus.Error.TimedOut"), RefusalReason::NoAnswer},
    };
    const auto* const found =
        std::ranges::find_if(kKnown, [&](const Known& each) { return error.endsWith(each.ending); });
    return found == kKnown.end() ? RefusalReason::Failed : found->reason;
}

bool isError(const QDBusMessage& reply)
{
    return reply.type() == QDBusMessage::ErrorMessage;
}

// The reply's argument, which is empty when it has another signature.
QVariant argumentOf(const QDBusMessage& reply, const char* signature)
{
    return reply.signature() == QLatin1String(signature) ? reply.arguments().value(0) : QVariant();
}

template <typename Enumeration>
Enumeration enumerationFrom(const QVariant& value, Enumeration otherwise)
{
    const auto number = signedNumberFrom(value);
    return number ? static_cast<Enumeration>(*number) : otherwise;
}

template <typename Enumeration>
std::optional<Enumeration> optionalFrom(const QVariant& value)
{
    const auto number = numberFrom(value);
    return number ? std::optional(static_cast<Enumeration>(*number)) : std::nullopt;
}

std::string plainText(const QVariant& value)
{
    return textFrom(value);
}

std::uint32_t numberOrZero(const QVariant& value)
{
    return numberFrom(value).value_or(0);
}

std::optional<SignalLevels> levelsFrom(const QVariant& value)
{
    const QVariantMap map = mapFrom(value);
    const SignalLevels levels{.rssi = levelFrom(map.value("rssi")),
                              .rscp = levelFrom(map.value("rscp")),
                              .ecio = levelFrom(map.value("ecio")),
                              .rsrp = levelFrom(map.value("rsrp")),
                              .rsrq = levelFrom(map.value("rsrq")),
                              .snr = levelFrom(map.value("snr")),
                              .errorRate = levelFrom(map.value("error-rate"))};
    return levels == SignalLevels{} ? std::nullopt : std::optional(levels);
}

ModemCell cellFrom(const QVariantMap& map)
{
    ModemCell cell;
    cell.type = optionalFrom<CellType>(map.value("cell-type")).value_or(CellType::Unknown);
    cell.serving = flagFrom(map.value("serving")).value_or(false);
    cell.operatorCode = textFrom(map.value("operator-id"));
    cell.lac = hexadecimalFrom(map.value("lac"));
    cell.tac = hexadecimalFrom(map.value("tac"));
    cell.ci = longHexadecimalFrom(map.value("ci"));
    for (const char* name : {"arfcn", "uarfcn", "earfcn", "nrarfcn"})
        if (const auto channel = numberFrom(map.value(name)))
            cell.channel = channel;
    cell.physicalCell = hexadecimalFrom(map.value("physical-ci"));
    cell.scramblingCode = numberFrom(map.value("psc"));
    (cell.type == CellType::Cdma ? cell.cdmaBaseStationId : cell.baseStation) =
        hexadecimalFrom(map.value("base-station-id"));
    cell.cellParameter = numberFrom(map.value("cell-parameter-id"));
    cell.timingAdvance = numberFrom(map.value("timing-advance"));
    cell.rxLevel = numberFrom(map.value("rx-level"));
    cell.pathLoss = numberFrom(map.value("path-loss"));
    cell.rscp = levelFrom(map.value("rscp"));
    cell.ecio = levelFrom(map.value("ecio"));
    cell.rsrp = levelFrom(map.value("rsrp"));
    cell.rsrq = levelFrom(map.value("rsrq"));
    cell.sinr = levelFrom(map.value("sinr"));
    cell.systemId = hexadecimalFrom(map.value("sid"));
    cell.networkId = hexadecimalFrom(map.value("nid"));
    cell.referencePn = hexadecimalFrom(map.value("ref-pn"));
    cell.pilotStrength = numberFrom(map.value("pilot-strength"));
    return cell;
}

// The sources' findings by source, of which one is "MCC,MNC,LAC,CI,TAC" with the last three in hexadecimal.
std::optional<ModemLocation> locationFrom(const QVariant& value)
{
    const auto argument = argumentFrom(value, "a{uv}");
    if (!argument)
        return std::nullopt;
    const auto found = qdbus_cast<QMap<uint, QDBusVariant>>(*argument).value(kLacCi).variant();
    if (found.typeId() != QMetaType::QString)
        return std::nullopt;
    const QStringList parts = found.toString().left(kLongestBusText).split(QLatin1Char(','));
    constexpr qsizetype kParts = 5;
    if (parts.size() < kParts)
        return std::nullopt;
    ModemLocation location{.mcc = textFrom(parts[0]),
                           .mnc = textFrom(parts[1]),
                           .lac = hexadecimalFrom(parts[2]),
                           .ci = longHexadecimalFrom(parts[3]),
                           .tac = hexadecimalFrom(parts[4])};
    return location == ModemLocation{} ? std::nullopt : std::optional(location);
}

} // namespace

template <typename Use>
void WatchedModem::Properties::with(const char* name, Use use) const
{
    const auto found = values.find(QLatin1String(name));
    if (found != values.end())
        use(*found);
    else if (all)
        use(QVariant());
}

template <typename Target, typename Reader>
void WatchedModem::Properties::read(const char* name, Target& target, Reader reader) const
{
    with(name, [&](const QVariant& value) { target = reader(value); });
}

WatchedModem::WatchedModem(const QDBusConnection& bus, const QString& path, const BusInterfaces& interfaces,
                           SystemLog& log, std::function<void()> changed)
    : _path(path),
      _number(path.mid(bus::kModemPaths.size()).toUInt()),
      _log(log),
      _changed(std::move(changed)),
      _calls(bus),
      _rateSetting{ModemService::Signal, bus::kSignal},
      _locationSetting{ModemService::Location, bus::kLocation}
{
    setInterfaces(interfaces);
}

void WatchedModem::setInterfaces(const BusInterfaces& interfaces)
{
    QStringList gone = _interfaces;
    for (const auto& each : interfaces.keys())
        gone.removeAll(each);
    removeInterfaces(gone);
    addInterfaces(interfaces);
}

void WatchedModem::addInterfaces(const BusInterfaces& interfaces)
{
    for (auto each = interfaces.begin(); each != interfaces.end(); ++each) {
        if (!_interfaces.contains(each.key())) {
            _interfaces.push_back(each.key());
            if (each.key() == bus::kSignal)
                permit(ModemService::Signal);
            else if (each.key() == bus::kLocation)
                permit(ModemService::Location);
        }
        readInterface(each.key(), {each.value(), true});
    }
    settle();
}

void WatchedModem::removeInterfaces(const QStringList& names)
{
    const QVariantMap nothing;
    for (const auto& each : names)
        if (_interfaces.removeAll(each) > 0)
            readInterface(each, {nothing, true});
    settle();
}

void WatchedModem::changeProperties(const QString& path, const QString& interface, QVariantMap changed,
                                    const QStringList& invalidated)
{
    for (const auto& each : invalidated)
        changed.insert(each, QVariant());
    const Properties properties{changed, false};
    if (path == _path) {
        readInterface(interface, properties);
        settle();
        return;
    }
    // What changed before all is known comes with the reply that is on its way.
    if (interface == bus::kSim && path == _sim.path && _sim.known)
        readSim(properties, *_sim.known);
    const auto bearer = std::ranges::find(_bearers, path, &Part<ModemBearer>::path);
    if (interface == bus::kBearer && bearer != _bearers.end() && bearer->known)
        readBearer(properties, *bearer->known);
    publishParts();
}

void WatchedModem::forgetMeasurements()
{
    _state.signal = {};
    _state.signalQuality.reset();
    _state.location.reset();
    _state.cells.clear();
}

void WatchedModem::setMeasuring(bool measuring)
{
    if (std::exchange(_measuring, measuring) == measuring)
        return;
    _askAgain.clear(); // the user may have got the permission meanwhile
    settle();
}

bool WatchedModem::isAtRest() const
{
    return _rateSetting.phase == Setting::Phase::Theirs && _locationSetting.phase == Setting::Phase::Theirs;
}

void WatchedModem::tick()
{
    _now += 1s;
    _calls.tick();
    if (_cellsAwaited)
        *_cellsAwaited += 1s;
    if (_cellsAwaited == kCellsLimit) {
        _state.cells.clear();
        refuse({ModemService::CellInformation, RefusalReason::NoAnswer, {}});
    }
    fetchParts();
    settle();
    if (!_measuring || !isMeasurable())
        return;
    askLocation();
    askCells();
}

void WatchedModem::readInterface(const QString& interface, const Properties& properties)
{
    if (interface == bus::kModem)
        readModem(properties);
    else if (interface == bus::kModem3gpp)
        read3gpp(properties);
    else if (interface == bus::kSignal)
        readSignal(properties);
    else if (interface == bus::kLocation)
        readLocationSettings(properties);
}

void WatchedModem::readModem(const Properties& properties)
{
    const bool wasMeasurable = isMeasurable();
    properties.read("DeviceIdentifier", _state.identifier, plainText);
    properties.read("Manufacturer", _state.manufacturer, plainText);
    properties.read("Model", _state.model, plainText);
    properties.read("Revision", _state.revision, plainText);
    properties.read("EquipmentIdentifier", _state.equipmentIdentifier, plainText);
    properties.read("State", _state.phase,
                    [](const QVariant& value) { return enumerationFrom(value, ModemPhase::Unknown); });
    properties.read("StateFailedReason", _state.failure,
                    [](const QVariant& value) { return enumerationFrom(value, ModemFailure::None); });
    properties.read("UnlockRequired", _state.lock,
                    [](const QVariant& value) { return enumerationFrom(value, ModemLock::Unknown); });
    properties.read("AccessTechnologies", _state.accessTechnologies, numberOrZero);
    properties.with("SignalQuality", [this](const QVariant& value) { readQuality(value); });
    properties.with("Sim", [this](const QVariant& value) { followSim(pathFrom(value)); });
    properties.with("Bearers", [this](const QVariant& value) { followBearers(pathsFrom(value, kMostBearers)); });
    if (isMeasurable() && !wasMeasurable)
        _askAgain.clear();
}

// "(ub)": percent, and whether it was measured recently.
void WatchedModem::readQuality(const QVariant& value)
{
    _state.signalQuality.reset();
    _state.signalQualityRecent = false;
    if (const auto structure = argumentFrom(value, "(ub)")) {
        structure->beginStructure();
        std::uint32_t percent = 0;
        *structure >> percent >> _state.signalQualityRecent;
        structure->endStructure();
        if (percent <= kWhole)
            _state.signalQuality = percent;
    }
}

void WatchedModem::read3gpp(const Properties& properties)
{
    properties.read("RegistrationState", _state.registration, optionalFrom<ModemRegistration>);
    properties.read("OperatorCode", _state.operatorCode, plainText);
    properties.read("OperatorName", _state.operatorName, plainText);
    properties.read("PacketServiceState", _state.packetService, optionalFrom<PacketService>);
}

void WatchedModem::readSignal(const Properties& properties)
{
    properties.read("Rate", _rate, numberOrZero);
    properties.read("Gsm", _state.signal.gsm, levelsFrom);
    properties.read("Umts", _state.signal.umts, levelsFrom);
    properties.read("Lte", _state.signal.lte, levelsFrom);
    properties.read("Nr5g", _state.signal.nr, levelsFrom);
}

void WatchedModem::readLocationSettings(const Properties& properties)
{
    properties.read("Capabilities", _locationCapabilities, numberOrZero);
    properties.read("Enabled", _locationSources, numberOrZero);
    properties.read("SignalsLocation", _signalsLocation,
                    [](const QVariant& value) { return flagFrom(value).value_or(false); });
}

void WatchedModem::readSim(const Properties& properties, ModemSim& sim)
{
    properties.read("SimIdentifier", sim.identifier, plainText);
    properties.read("Imsi", sim.imsi, plainText);
    properties.read("OperatorIdentifier", sim.operatorCode, plainText);
    properties.read("OperatorName", sim.operatorName, plainText);
}

// Only named keys: among the others of "Properties" are a user name and a password.
void WatchedModem::readBearer(const Properties& properties, ModemBearer& bearer)
{
    const auto address = [](const QVariant& value) { return textFrom(mapFrom(value).value("address")); };
    properties.read("Connected", bearer.connected, flagFrom);
    properties.read("Suspended", bearer.suspended, flagFrom);
    properties.read("Interface", bearer.interface, plainText);
    properties.read("Ip4Config", bearer.address4, address);
    properties.read("Ip6Config", bearer.address6, address);
    properties.read("Properties", bearer.apn,
                    [](const QVariant& value) { return textFrom(mapFrom(value).value("apn")); });
    properties.with("Stats", [&](const QVariant& value) {
        const QVariantMap statistics = mapFrom(value);
        bearer.duration = numberFrom(statistics.value("duration"));
        bearer.receivedBytes = longNumberFrom(statistics.value("rx-bytes"));
        bearer.sentBytes = longNumberFrom(statistics.value("tx-bytes"));
    });
}

void WatchedModem::followSim(const QString& path)
{
    if (path == _sim.path)
        return;
    _sim = {path};
    permit(ModemService::Sim);
    publishParts();
    fetchParts();
}

void WatchedModem::followBearers(const QList<QDBusObjectPath>& paths)
{
    std::vector<Part<ModemBearer>> bearers;
    for (const auto& each : paths) {
        const auto known = std::ranges::find(_bearers, each.path(), &Part<ModemBearer>::path);
        bearers.push_back(known != _bearers.end() ? *known : Part<ModemBearer>{each.path()});
    }
    _bearers = std::move(bearers);
    publishParts();
    fetchParts();
}

void WatchedModem::fetchParts()
{
    if (!_sim.path.isEmpty())
        fetch(&WatchedModem::findSim, _sim, bus::kSim, ModemService::Sim, readSim);
    for (auto& each : _bearers)
        fetch(&WatchedModem::findBearer, each, bus::kBearer, ModemService::Data, readBearer);
}

template <typename Known>
void WatchedModem::fetch(Part<Known>* (WatchedModem::*find)(const QString&), Part<Known>& part,
                         const QString& interface, ModemService service, void (*read)(const Properties&, Known&))
{
    if (part.known || part.isAsked || !mayAsk(service))
        return;
    part.isAsked = true;
    _calls.call(part.path, bus::kProperties, QStringLiteral("GetAll"), {interface}, kCallLimit,
                [this, find, path = part.path, service, read](const QDBusMessage& reply) {
                    auto* const asked = (this->*find)(path);
                    if (asked == nullptr)
                        return; // it has gone meanwhile
                    asked->isAsked = false;
                    if (isError(reply)) {
                        refuse(service, reply);
                    } else {
                        permit(service);
                        const QVariantMap values = mapFrom(argumentOf(reply, "a{sv}"));
                        read({values, true}, asked->known.emplace());
                        publishParts();
                    }
                    _changed();
                });
}

WatchedModem::Part<ModemSim>* WatchedModem::findSim(const QString& path)
{
    return _sim.path == path ? &_sim : nullptr;
}

WatchedModem::Part<ModemBearer>* WatchedModem::findBearer(const QString& path)
{
    const auto found = std::ranges::find(_bearers, path, &Part<ModemBearer>::path);
    return found == _bearers.end() ? nullptr : &*found;
}

void WatchedModem::publishParts()
{
    _state.sim = _sim.known;
    _state.bearers.clear();
    for (const auto& each : _bearers)
        if (each.known)
            _state.bearers.push_back(*each.known);
}

bool WatchedModem::isMeasurable() const
{
    return _state.phase >= ModemPhase::Enabled;
}

// Brings the daemon's settings to where they should be. Called after everything that may matter for them.
void WatchedModem::settle()
{
    settleRate();
    settleLocation();
    if (!_measuring || !isMeasurable()) {
        _state.location.reset();
        _state.cells.clear();
    }
}

void WatchedModem::settleRate()
{
    auto& phase = _rateSetting.phase;
    const bool needed = _measuring && isMeasurable();
    if (phase == Setting::Phase::Ours && _rate != kRate && (_rate == 0 || !needed))
        phase = Setting::Phase::Theirs; // another program has changed it
    if (needed && !_interfaces.contains(bus::kSignal)) {
        refuse({ModemService::Signal, RefusalReason::NotSupported, {}});
    } else if (needed && phase == Setting::Phase::Theirs && (_rate == 0 || _rate > kRate)) {
        // Now: the daemon may tell the new rate before it answers.
        take(_rateSetting, {kRate}, [this, before = _rate] {
            _rateBefore = before;
            _rate = kRate;
        });
    } else if (!_measuring && phase == Setting::Phase::Ours) {
        putBack(_rateSetting, {_rateBefore}, [this] { _rate = _rateBefore; });
    }
}

void WatchedModem::settleLocation()
{
    auto& phase = _locationSetting.phase;
    const bool needed = _measuring && isMeasurable(), enabled = (_locationSources & kLacCi) != 0;
    if (phase == Setting::Phase::Ours && !enabled)
        phase = Setting::Phase::Theirs; // another program has changed it
    if (needed && (_locationCapabilities & kLacCi) == 0) {
        refuse({ModemService::Location, RefusalReason::NotSupported, {}});
    } else if (needed && phase == Setting::Phase::Theirs && !enabled) {
        take(_locationSetting, {_locationSources | kLacCi, _signalsLocation}, [this] { _locationSources |= kLacCi; });
    } else if (!_measuring && phase == Setting::Phase::Ours) {
        putBack(_locationSetting, {_locationSources & ~kLacCi, _signalsLocation},
                [this] { _locationSources &= ~kLacCi; });
    }
}

void WatchedModem::take(Setting& setting, const QVariantList& arguments, std::function<void()> taken)
{
    if (!mayAsk(setting.service))
        return;
    setting.phase = Setting::Phase::Taking;
    _calls.call(_path, setting.interface, kSetup, arguments, kCallLimit,
                [this, &setting, taken = std::move(taken)](const QDBusMessage& reply) {
                    // A daemon that does not answer may do it later, so it is put back as well.
                    const bool done = !isError(reply) || reasonOf(reply.errorName()) == RefusalReason::NoAnswer;
                    setting.phase = done ? Setting::Phase::Ours : Setting::Phase::Theirs;
                    if (done)
                        taken();
                    if (isError(reply))
                        refuse(setting.service, reply);
                    else
                        permit(setting.service);
                    settle();
                    _changed();
                });
}

void WatchedModem::putBack(Setting& setting, const QVariantList& arguments, std::function<void()> returned)
{
    setting.phase = Setting::Phase::Returning;
    _calls.call(_path, setting.interface, kSetup, arguments, kCallLimit,
                [this, &setting, returned = std::move(returned)](const QDBusMessage& reply) {
                    setting.phase = Setting::Phase::Theirs;
                    if (isError(reply))
                        _log.write(Priority::Warning, "the modem's %s setting was not put back: %s",
                                   nameOf(setting.service), textFrom(reply.errorMessage()));
                    else
                        returned();
                    settle();
                    _changed();
                });
}

void WatchedModem::askLocation()
{
    if (_locationIsAsked || _now < _nextLocation || (_locationSources & kLacCi) == 0 || !mayAsk(ModemService::Location))
        return;
    _locationIsAsked = true;
    _nextLocation = _now + kLocationInterval;
    _calls.call(_path, bus::kLocation, QStringLiteral("GetLocation"), {}, kCallLimit,
                [this](const QDBusMessage& reply) {
                    _locationIsAsked = false;
                    _state.location.reset();
                    if (isError(reply)) {
                        refuse(ModemService::Location, reply);
                    } else {
                        permit(ModemService::Location);
                        if (_measuring && isMeasurable())
                            _state.location = locationFrom(argumentOf(reply, "a{uv}"));
                    }
                    _changed();
                });
}

void WatchedModem::askCells()
{
    if (_cellsAwaited || _now < _nextCells || !mayAsk(ModemService::CellInformation))
        return;
    _cellsAwaited = 0s;
    _calls.call(_path, bus::kModem, QStringLiteral("GetCellInfo"), {}, kCellsEnd, [this](const QDBusMessage& reply) {
        takeCells(reply);
        _changed();
    });
}

void WatchedModem::takeCells(const QDBusMessage& reply)
{
    const bool late = *std::exchange(_cellsAwaited, std::nullopt) >= kCellsLimit;
    _nextCells = _now + kCellsInterval;
    if (late)
        return;
    _state.cells.clear();
    if (isError(reply))
        return refuse(ModemService::CellInformation, reply);
    permit(ModemService::CellInformation);
    if (!_measuring || !isMeasurable())
        return;
    for (const auto& each : mapsFrom(argumentOf(reply, "aa{sv}"), kMostCells))
        _state.cells.push_back(cellFrom(each));
}

bool WatchedModem::mayAsk(ModemService service) const
{
    const auto found = _askAgain.find(service);
    return found == _askAgain.end() || _now >= found->second;
}

void WatchedModem::refuse(ModemService service, const QDBusMessage& error)
{
    const auto reason = reasonOf(error.errorName());
    refuse({service, reason, reason == RefusalReason::Failed ? textFrom(error.errorMessage()) : std::string()});
}

// Permission and support do not come by themselves: they are asked for again when a display connects or the modem
// changes.
void WatchedModem::refuse(const ModemRefusal& refusal)
{
    const bool lasts = refusal.reason == RefusalReason::NotPermitted || refusal.reason == RefusalReason::NotSupported;
    _askAgain[refusal.service] = lasts ? seconds::max() : _now + kPause;
    auto& refusals = _state.refusals;
    const auto place = std::ranges::lower_bound(refusals, refusal.service, {}, &ModemRefusal::service);
    if (place == refusals.end() || place->service != refusal.service)
        refusals.insert(place, refusal);
    else if (*place != refusal)
        *place = refusal;
    else
        return;
    _log.write(Priority::Warning, "the modem's %s: %s", nameOf(refusal.service), wordsFor(refusal));
}

void WatchedModem::permit(ModemService service)
{
    _askAgain.erase(service);
    std::erase_if(_state.refusals, [&](const ModemRefusal& each) { return each.service == service; });
}

} // namespace kestrum
