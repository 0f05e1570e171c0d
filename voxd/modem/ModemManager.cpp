#include "voxd/modem/ModemManager.h"

#include "platform/SystemLog.h"
#include "voxd/modem/BusNames.h"

#include <QDBusArgument>
#include <QDBusServiceWatcher>

#include <algorithm>
#include <string_view>
#include <utility>
#include <vector>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using std::chrono::seconds;

constexpr seconds kTick = 1s;
// The list of all modems repairs what a lost signal left wrong, and shows that the daemon still answers.
constexpr seconds kListInterval = 5s, kListLimit = 4s;
constexpr seconds kConnectInterval = 5s;
constexpr std::size_t kMostModems = 16, kMostIdentifiers = 256;

const QString kBus = QStringLiteral("org.freedesktop.DBus"), kBusPath = QStringLiteral("/org/freedesktop/DBus");

constexpr std::string_view kFirst = "first", kAll = "all";

std::string reasonOf(const QDBusMessage& reply)
{
    if (reply.type() != QDBusMessage::ErrorMessage)
        return "its list of modems cannot be read";
    return reply.errorName() == bus::kNoReply ? "no answer" : textFrom(reply.errorMessage());
}

QString connectionName()
{
    static unsigned last = 0;
    return QStringLiteral("kestrum-modem-%1").arg(++last);
}

} // namespace

QDBusConnection ModemManager::systemBus(const QString& name)
{
    return QDBusConnection::connectToBus(QDBusConnection::SystemBus, name);
}

ModemManager::ModemManager(Connect connect, std::string choice, MainQueue& queue, SystemLog& log)
    : _connect(std::move(connect)), _choice(std::move(choice)), _queue(queue), _log(log)
{
    connectBus();
}

ModemManager::~ModemManager()
{
    disconnectBus();
}

void ModemManager::setMeasuring(bool measuring)
{
    measuring = measuring && !_ending;
    if (std::exchange(_measuring, measuring) == measuring)
        return;
    if (!_bus)
        connectBus();
    publish();
}

bool ModemManager::isAtRest() const
{
    return std::ranges::all_of(_modems, [](const auto& each) { return each.second->isAtRest(); });
}

void ModemManager::end(seconds limit, std::function<void()> done)
{
    _ending = true;
    _ended = std::move(done);
    _untilEnd = limit;
    setMeasuring(false);
    endIfAtRest();
}

void ModemManager::endIfAtRest()
{
    if (_ended && (isAtRest() || _untilEnd <= 0s))
        std::exchange(_ended, nullptr)();
}

void ModemManager::setDaemon(ModemDaemon daemon)
{
    if (std::exchange(_states.daemon, daemon) != daemon)
        changed();
}

void ModemManager::connectBus()
{
    _untilNext = kConnectInterval;
    auto connection = _connect(connectionName());
    if (!connection.isConnected()) {
        QDBusConnection::disconnectFromBus(connection.name());
        setDaemon(ModemDaemon::NoBus);
        return;
    }
    setDaemon(ModemDaemon::Absent);
    _bus.emplace(connection);
    _calls = std::make_unique<BusCalls>(connection);
    _watcher =
        std::make_unique<QDBusServiceWatcher>(bus::kService, connection, QDBusServiceWatcher::WatchForOwnerChange);
    connect(_watcher.get(), &QDBusServiceWatcher::serviceOwnerChanged, this,
            [this](const QString&, const QString&, const QString& owner) { setOwner(owner); });
    const auto listen = [&](const QString& interface, const char* signal, const char* slot) {
        connection.connect(bus::kService, QString(), interface, QLatin1String(signal), this, slot);
    };
    listen(bus::kObjectManager, "InterfacesAdded", SLOT(objectsAdded(QDBusMessage)));
    listen(bus::kObjectManager, "InterfacesRemoved", SLOT(objectsRemoved(QDBusMessage)));
    listen(bus::kProperties, "PropertiesChanged", SLOT(propertiesChanged(QDBusMessage)));

    auto owner = QDBusMessage::createMethodCall(kBus, kBusPath, kBus, QStringLiteral("GetNameOwner"));
    owner << bus::kService;
    _calls->call(owner, kListLimit, [this](const QDBusMessage& reply) {
        if (reply.type() == QDBusMessage::ReplyMessage)
            setOwner(reply.arguments().value(0).toString());
    });
}

void ModemManager::disconnectBus()
{
    if (!_bus)
        return;
    _modems.clear();
    _owner.clear();
    _watcher.reset();
    _calls.reset();
    const QString name = _bus->name();
    _bus.reset();
    QDBusConnection::disconnectFromBus(name);
}

// A daemon that ends has no settings to be put back.
void ModemManager::setOwner(const QString& owner)
{
    if (std::exchange(_owner, owner) == owner)
        return;
    _log.write(Priority::Notice, owner.isEmpty() ? "ModemManager has gone" : "ModemManager is there");
    _modems.clear();
    _states.daemonVersion.clear();
    setDaemon(owner.isEmpty() ? ModemDaemon::Absent : ModemDaemon::Silent);
    if (!owner.isEmpty()) {
        askVersion();
        list();
    }
    publish();
}

void ModemManager::askVersion()
{
    _calls->call(bus::kManagerPath, bus::kProperties, QStringLiteral("Get"), {bus::kManager, QStringLiteral("Version")},
                 kListLimit, [this, owner = _owner](const QDBusMessage& reply) {
                     if (owner != _owner || reply.signature() != u"v")
                         return;
                     _states.daemonVersion = textFrom(reply.arguments().value(0).value<QDBusVariant>().variant());
                     changed();
                 });
}

void ModemManager::list()
{
    _untilNext = kListInterval;
    _calls->call(bus::kManagerPath, bus::kObjectManager, QStringLiteral("GetManagedObjects"), {}, kListLimit,
                 [this, owner = _owner](const QDBusMessage& reply) {
                     if (owner == _owner)
                         takeList(reply);
                 });
}

void ModemManager::takeList(const QDBusMessage& reply)
{
    const auto before = _states.daemon;
    if (const auto objects = argumentFrom(reply.arguments().value(0), "a{oa{sa{sv}}}")) {
        takeObjects(qdbus_cast<BusObjects>(*objects));
        setDaemon(ModemDaemon::Present);
    } else {
        for (const auto& each : _modems)
            each.second->forgetMeasurements();
        setDaemon(reply.errorName() == bus::kAccessDenied ? ModemDaemon::NotPermitted : ModemDaemon::Silent);
        if (_states.daemon != before)
            _log.write(Priority::Warning, "ModemManager: %s", reasonOf(reply));
    }
    publish();
}

void ModemManager::takeObjects(const BusObjects& objects)
{
    for (auto each = _modems.begin(); each != _modems.end();) {
        const auto modem = each++;
        if (!objects.contains(QDBusObjectPath(modem->first)))
            remove(modem);
    }
    for (auto each = objects.begin(); each != objects.end(); ++each) {
        const auto modem = _modems.find(each.key().path());
        if (modem != _modems.end())
            modem->second->setInterfaces(each.value());
        else
            add(each.key().path(), each.value());
    }
}

void ModemManager::add(const QString& path, const BusInterfaces& interfaces)
{
    if (!path.startsWith(bus::kModemPaths) || !interfaces.contains(bus::kModem) || _modems.size() >= kMostModems)
        return;
    const auto& modem =
        *_modems.emplace(path, std::make_unique<WatchedModem>(*_bus, path, interfaces, _log, [this] { publish(); }))
             .first->second;
    _log.write(Priority::Notice, "modem %u (%s) is there", modem.number(), modem.state().model);
}

void ModemManager::remove(Modems::iterator modem)
{
    _log.write(Priority::Notice, "modem %u (%s) has gone", modem->second->number(), modem->second->state().model);
    _modems.erase(modem);
}

void ModemManager::objectsAdded(const QDBusMessage& signal)
{
    if (!isFromDaemon(signal, "oa{sa{sv}}"))
        return;
    const QString path = pathFrom(signal.arguments()[0]);
    const auto interfaces = qdbus_cast<BusInterfaces>(signal.arguments()[1]);
    if (const auto modem = _modems.find(path); modem != _modems.end())
        modem->second->addInterfaces(interfaces);
    else
        add(path, interfaces);
    publish();
}

void ModemManager::objectsRemoved(const QDBusMessage& signal)
{
    if (!isFromDaemon(signal, "oas"))
        return;
    const auto modem = _modems.find(pathFrom(signal.arguments()[0]));
    if (modem == _modems.end())
        return;
    const QStringList interfaces = signal.arguments()[1].toStringList();
    if (interfaces.contains(bus::kModem))
        remove(modem);
    else
        modem->second->removeInterfaces(interfaces);
    publish();
}

void ModemManager::propertiesChanged(const QDBusMessage& signal)
{
    if (!isFromDaemon(signal, "sa{sv}as"))
        return;
    const QString interface = signal.arguments()[0].toString();
    const auto values = mapFrom(signal.arguments()[1]);
    const QStringList invalidated = signal.arguments()[2].toStringList();
    for (const auto& each : _modems)
        each.second->changeProperties(signal.path(), interface, values, invalidated);
    publish();
}

bool ModemManager::isFromDaemon(const QDBusMessage& signal, const char* signature) const
{
    return signal.service() == _owner && signal.signature() == QLatin1String(signature);
}

void ModemManager::tick()
{
    if (_bus && !_bus->isConnected()) {
        disconnectBus();
        setDaemon(ModemDaemon::NoBus);
    }
    _untilNext -= kTick;
    _untilEnd -= kTick;
    if (!_bus) {
        if (_untilNext <= 0s)
            connectBus();
    } else {
        _calls->tick();
        for (const auto& each : _modems)
            each.second->tick();
        if (!_owner.isEmpty() && _untilNext <= 0s)
            list();
    }
    publish();
}

bool ModemManager::isChosen(const WatchedModem& modem) const
{
    if (_choice == kAll)
        return true;
    if (_choice == kFirst)
        return std::ranges::none_of(_modems, [&](const auto& each) { return each.second->number() < modem.number(); });
    return modem.state().identifier.starts_with(_choice);
}

// A modem that comes back has its number again.
std::uint32_t ModemManager::lastingNumber(const std::string& identifier)
{
    if (identifier.empty())
        return 0;
    auto found = std::ranges::find(_identifiers, identifier);
    if (found == _identifiers.end()) {
        if (_identifiers.size() == kMostIdentifiers)
            return 0;
        found = _identifiers.insert(found, identifier);
    }
    return static_cast<std::uint32_t>(found - _identifiers.begin()) + 1;
}

// Follows every change: who is chosen, what is known of them, and whether there is something to wait for.
void ModemManager::publish()
{
    std::vector<const WatchedModem*> chosen;
    for (const auto& [path, modem] : _modems) {
        const bool isOne = isChosen(*modem);
        modem->setMeasuring(_measuring && isOne);
        if (isOne)
            chosen.push_back(modem.get());
    }
    std::vector<ModemState> modems;
    for (const auto* each : chosen) {
        modems.push_back(each->state());
        modems.back().number = lastingNumber(each->state().identifier);
    }
    std::ranges::stable_sort(modems, {}, &ModemState::number);
    const auto others = static_cast<std::uint32_t>(_modems.size() - chosen.size());
    if (modems != _states.modems || others != _states.otherModems) {
        _states.modems = std::move(modems);
        _states.otherModems = others;
        changed();
    }

    const bool waiting = _measuring || _ended || !isAtRest() || (_calls && !_calls->isEmpty());
    if (!waiting)
        _ticks.reset();
    else if (!_ticks)
        _ticks = _queue.repeat(kTick, [this] { tick(); });
    endIfAtRest();
}

} // namespace kestrum
