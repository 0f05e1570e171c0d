#pragma once

#include "qtplatform/PrivateBus.h"

#include <QDBusArgument>
#include <QDBusMessage>
#include <QDBusMetaType>
#include <QDBusObjectPath>
#include <QDBusVirtualObject>

#include <functional>
#include <map>
#include <string>
#include <vector>

namespace kestrum {

using FakeInterfaces = QMap<QString, QVariantMap>;
using FakeObjects = QMap<QDBusObjectPath, FakeInterfaces>;
using FakeFindings = QMap<uint, QDBusVariant>; ///< of GetLocation, by source
using FakeRetries = QMap<uint, uint>;          ///< that are left, by lock

/// "(ub)", as the property SignalQuality has it.
struct FakeQuality {
    uint percent = 0;
    bool recent = false;
};
inline QDBusArgument& operator<<(QDBusArgument& argument, const FakeQuality& quality)
{
    argument.beginStructure();
    argument << quality.percent << quality.recent;
    argument.endStructure();
    return argument;
}
inline const QDBusArgument& operator>>(const QDBusArgument& argument, FakeQuality& quality)
{
    argument.beginStructure();
    argument >> quality.percent >> quality.recent;
    argument.endStructure();
    return argument;
}

} // namespace kestrum

Q_DECLARE_METATYPE(kestrum::FakeQuality)

namespace kestrum {

/// The D-Bus side of a ModemManager whose modems say what the test wants. It is on the bus while it lives.
class FakeModemManager final : public QDBusVirtualObject {
public:
    static inline const QString kService = "org.freedesktop.ModemManager1";
    static inline const QString kModem = kService + ".Modem", kModem3gpp = kModem + ".Modem3gpp",
                                kSignal = kModem + ".Signal", kLocation = kModem + ".Location",
                                kSim = kService + ".Sim", kBearer = kService + ".Bearer";

    using Method = std::function<QDBusMessage(const QDBusMessage& call)>;

    explicit FakeModemManager(const PrivateBus& bus) : _connection(bus.connect(name()))
    {
        qDBusRegisterMetaType<FakeInterfaces>();
        qDBusRegisterMetaType<FakeObjects>();
        qDBusRegisterMetaType<FakeFindings>();
        qDBusRegisterMetaType<FakeQuality>();
        qDBusRegisterMetaType<QList<QVariantMap>>();
        qDBusRegisterMetaType<QList<uint>>();
        qDBusRegisterMetaType<FakeRetries>();
        _connection.registerVirtualObject("/", this, QDBusConnection::SubPath);
        _connection.registerService(kService);

        answers["Setup"] = [this](const QDBusMessage& call) { return setUp(call); };
        answers["GetLocation"] = [this](const QDBusMessage& call) {
            FakeFindings found;
            if (isLocating(call.path()))
                found[1] = QDBusVariant(location);
            return call.createReply(QVariant::fromValue(found));
        };
        answers["GetCellInfo"] = [this](const QDBusMessage& call) {
            return call.createReply(QVariant::fromValue(cells));
        };
    }
    FakeModemManager(const FakeModemManager&) = delete;
    FakeModemManager& operator=(const FakeModemManager&) = delete;
    ~FakeModemManager() override { QDBusConnection::disconnectFromBus(_connection.name()); }

    /// A registered modem on LTE without a SIM and bearers, as the real daemon describes one.
    static FakeInterfaces modem(const QString& identifier)
    {
        return {{kModem,
                 {{"State", 8},
                  {"StateFailedReason", 0U},
                  {"UnlockRequired", 1U},
                  {"UnlockRetries", QVariant::fromValue(FakeRetries{{2U, 3U}})},
                  {"AccessTechnologies", 0x4000U},
                  {"SignalQuality", QVariant::fromValue(FakeQuality{54, true})},
                  {"Manufacturer", "Test"},
                  {"Model", "Fake"},
                  {"Revision", "1"},
                  {"EquipmentIdentifier", "123456789012345"},
                  {"DeviceIdentifier", identifier},
                  {"Device", "/virtual/test"},
                  {"Drivers", QStringList{"virtual"}},
                  {"Plugin", "generic"},
                  {"PrimaryPort", "cdc-wdm0"},
                  {"OwnNumbers", QStringList()},
                  {"PowerState", 3U},
                  {"SupportedCapabilities", QVariant::fromValue(QList<uint>{4})},
                  {"CurrentCapabilities", 4U},
                  {"SupportedBands", QVariant::fromValue(QList<uint>())},
                  {"CurrentBands", QVariant::fromValue(QList<uint>())},
                  {"SupportedIpFamilies", 3U},
                  {"Sim", QVariant::fromValue(QDBusObjectPath("/"))},
                  {"Bearers", QVariant::fromValue(QList<QDBusObjectPath>())}}},
                {kModem3gpp,
                 {{"RegistrationState", 1U},
                  {"OperatorCode", "00101"},
                  {"OperatorName", "Test Net"},
                  {"PacketServiceState", 2U}}},
                {kSignal,
                 {{"Rate", 0U},
                  {"Gsm", QVariantMap()},
                  {"Umts", QVariantMap()},
                  {"Lte", QVariantMap()},
                  {"Nr5g", QVariantMap()}}},
                {kLocation, {{"Capabilities", 1U}, {"Enabled", 0U}, {"SignalsLocation", false}}}};
    }

    /// Returns the modem's path. Its number is greater than those of all before.
    QString plugIn(const FakeInterfaces& interfaces)
    {
        const QString path = "/org/freedesktop/ModemManager1/Modem/" + QString::number(_next++);
        objects[path] = interfaces;
        emitSignal("/org/freedesktop/ModemManager1", "org.freedesktop.DBus.ObjectManager", "InterfacesAdded",
                   {QVariant::fromValue(QDBusObjectPath(path)), QVariant::fromValue(interfaces)});
        return path;
    }
    void unplug(const QString& path)
    {
        const QStringList interfaces = objects[path].keys();
        objects.erase(path);
        emitSignal("/org/freedesktop/ModemManager1", "org.freedesktop.DBus.ObjectManager", "InterfacesRemoved",
                   {QVariant::fromValue(QDBusObjectPath(path)), interfaces});
    }
    void set(const QString& path, const QString& interface, const QVariantMap& values)
    {
        objects[path][interface].insert(values);
        emitSignal(path, "org.freedesktop.DBus.Properties", "PropertiesChanged", {interface, values, QStringList()});
    }
    void emitSignal(const QString& path, const QString& interface, const QString& name, const QVariantList& arguments)
    {
        auto signal = QDBusMessage::createSignal(path, interface, name);
        signal.setArguments(arguments);
        _connection.send(signal);
    }
    void send(const QDBusMessage& reply) { _connection.send(reply); }

    uint rate(const QString& path) const { return property(path, kSignal, "Rate").toUInt(); }
    uint sources(const QString& path) const { return property(path, kLocation, "Enabled").toUInt(); }
    bool isLocating(const QString& path) const { return (sources(path) & 1U) != 0; }
    /// The calls of a method so far.
    std::size_t calls(const QString& method) const
    {
        return static_cast<std::size_t>(
            std::ranges::count(asked, method, [](const auto& each) { return each.member(); }));
    }

    QString introspect(const QString&) const override { return {}; }
    bool handleMessage(const QDBusMessage& message, const QDBusConnection& connection) override
    {
        if (message.member() == "RoundTrip")
            return connection.send(message.createReply());
        if (remembers)
            asked.push_back(message);
        if (isSilent)
            return true;
        if (message.path().contains("/Modem/") && !objects.contains(message.path()))
            return connection.send(refusal(message, "org.freedesktop.DBus.Error.UnknownObject"));
        if (const auto found = answers.find(message.member()); found != answers.end()) {
            const auto reply = found->second(message);
            if (reply.type() != QDBusMessage::InvalidMessage)
                connection.send(reply);
        } else {
            connection.send(answer(message));
        }
        return true;
    }

    static QDBusMessage refusal(const QDBusMessage& call, const QString& name)
    {
        return call.createErrorReply(name, "because of the test");
    }

    std::map<QString, FakeInterfaces> objects; ///< by path: modems, SIMs, bearers
    std::map<QString, Method> answers;         ///< by method; an invalid message is no reply
    QString location = "001,01,0,1A2301,1502";
    QList<QVariantMap> cells;
    std::vector<QDBusMessage> asked;
    bool remembers = true;
    bool isSilent = false;

private:
    QVariant property(const QString& path, const QString& interface, const QString& name) const
    {
        const auto found = objects.find(path);
        return found == objects.end() ? QVariant() : found->second.value(interface).value(name);
    }
    static QString name()
    {
        static int last = 0;
        return "fake-" + QString::number(++last);
    }
    QDBusMessage answer(const QDBusMessage& call)
    {
        if (call.member() == "GetManagedObjects") {
            FakeObjects modems;
            for (const auto& [path, interfaces] : objects)
                if (path.contains("/Modem/"))
                    modems[QDBusObjectPath(path)] = interfaces;
            return call.createReply(QVariant::fromValue(modems));
        }
        const QString interface = call.arguments().value(0).toString();
        if (call.member() == "GetAll" && objects.contains(call.path()))
            return call.createReply(objects[call.path()][interface]);
        if (call.member() == "Get" && call.arguments().value(1) == "Version")
            return call.createReply(QVariant::fromValue(QDBusVariant("1.24.0")));
        return refusal(call, "org.freedesktop.DBus.Error.UnknownMethod");
    }
    QDBusMessage setUp(const QDBusMessage& call)
    {
        if (call.interface() == kSignal)
            set(call.path(), kSignal, {{"Rate", call.arguments()[0]}});
        else
            set(call.path(), kLocation, {{"Enabled", call.arguments()[0]}, {"SignalsLocation", call.arguments()[1]}});
        return call.createReply();
    }

    QDBusConnection _connection;
    unsigned _next = 0;
};

} // namespace kestrum
