#include "platform/qt/LinuxPreferences.h"

#include "platform/posix/UserDirectories.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QFile>
#include <QSettings>

namespace kestrum {
namespace {

constexpr int kBusTimeout = 1000; // ms

QString text(std::string_view utf8)
{
    return QString::fromUtf8(utf8.data(), static_cast<qsizetype>(utf8.size()));
}

// Without a session bus Qt would try to start one.
bool hasSessionBus()
{
    return qEnvironmentVariableIsSet("DBUS_SESSION_BUS_ADDRESS") ||
           QFile::exists(qEnvironmentVariable("XDG_RUNTIME_DIR") + "/bus");
}

} // namespace

void LinuxPreferences::setApplicationValue(std::string_view domain, std::string_view key, bool value)
{
    _set[std::string(domain)][std::string(key)] = value;
}

bool LinuxPreferences::synchronize(std::string_view domain)
{
    const auto pending = _set.extract(std::string(domain));
    const auto directory = userDirectory("XDG_CONFIG_HOME", ".config");
    QSettings file(QFile::decodeName(directory.c_str()) + "/" + text(domain) + ".ini", QSettings::IniFormat);
    if (!pending.empty())
        for (const auto& [key, value] : pending.mapped())
            file.setValue("preferences/" + text(key), value);
    file.sync();
    return file.status() == QSettings::NoError;
}

void LinuxPreferences::postChanged(std::string_view domain, std::string_view key)
{
    if (!hasSessionBus())
        return;
    static constexpr auto kConnection = "org.kestrum.preferences";
    auto bus = QDBusConnection::connectToBus(QDBusConnection::SessionBus, kConnection);
    if (bus.isConnected()) {
        auto changed = QDBusMessage::createSignal("/org/kestrum/Preferences", "org.kestrum.Preferences", "Changed");
        changed << text(domain) << text(key);
        bus.send(changed);
        // A signal is only queued. The bus answers this call after it has taken the signal, so that the signal is sent
        // even when the program ends now.
        bus.call(QDBusMessage::createMethodCall("org.freedesktop.DBus", "/org/freedesktop/DBus", "org.freedesktop.DBus",
                                                "GetId"),
                 QDBus::Block, kBusTimeout);
    }
    QDBusConnection::disconnectFromBus(kConnection);
}

} // namespace kestrum
