#pragma once

#include "qtplatform/PrivateBus.h"

#include <QDBusArgument>
#include <QDBusMessage>
#include <QDBusMetaType>
#include <QDBusVirtualObject>

namespace kestrum {

/// "(bba{ss})": polkit's answer.
struct Authorization {
    bool isAuthorized = true, isChallenge = false;
    QMap<QString, QString> details = {};
};
inline QDBusArgument& operator<<(QDBusArgument& argument, const Authorization& authorization)
{
    argument.beginStructure();
    argument << authorization.isAuthorized << authorization.isChallenge << authorization.details;
    argument.endStructure();
    return argument;
}
inline const QDBusArgument& operator>>(const QDBusArgument& argument, Authorization& authorization)
{
    argument.beginStructure();
    argument >> authorization.isAuthorized >> authorization.isChallenge >> authorization.details;
    argument.endStructure();
    return argument;
}

} // namespace kestrum

Q_DECLARE_METATYPE(kestrum::Authorization)

namespace kestrum {

/// A polkit that permits everything.
class Polkit final : public QDBusVirtualObject {
public:
    explicit Polkit(const PrivateBus& bus) : _connection(bus.connect("polkit"))
    {
        qDBusRegisterMetaType<QMap<QString, QString>>();
        qDBusRegisterMetaType<Authorization>();
        _connection.registerVirtualObject("/org/freedesktop/PolicyKit1/Authority", this);
        _connection.registerService("org.freedesktop.PolicyKit1");
    }
    Polkit(const Polkit&) = delete;
    Polkit& operator=(const Polkit&) = delete;
    ~Polkit() override { QDBusConnection::disconnectFromBus("polkit"); }

    QString introspect(const QString&) const override { return {}; }
    bool handleMessage(const QDBusMessage& message, const QDBusConnection& connection) override
    {
        const bool asks = message.member() == "CheckAuthorization";
        return connection.send(
            message.createReply(asks ? QVariant::fromValue(Authorization()) : QVariant(QVariantMap())));
    }

private:
    QDBusConnection _connection;
};

} // namespace kestrum
