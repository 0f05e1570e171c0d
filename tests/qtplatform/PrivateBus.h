#pragma once

#include "harness/Scratch.h"

#include <QDBusConnection>
#include <QProcess>
#include <QUrl>

#include <fstream>
#include <string>

namespace kestrum {

/// A separate bus, of no user and no system. Every connection may own any name.
class PrivateBus {
public:
    PrivateBus()
    {
        const QByteArray path = QUrl::toPercentEncoding(QString::fromStdString(_place / "bus"), "/", "~");
        std::ofstream(_place / "bus.conf")
            << R"(<!DOCTYPE busconfig PUBLIC "-//freedesktop//DTD D-Bus Bus Configuration 1.0//EN"
 "http://www.freedesktop.org/standards/dbus/1.0/busconfig.dtd">
<busconfig><type>session</type><auth>EXTERNAL</auth><listen>unix:path=)"
            << path.constData()
            << R"(</listen><policy context="default"><allow send_destination="*"/><allow receive_sender="*"/>
<allow own="*"/></policy></busconfig>)";
        _daemon.start("dbus-daemon", {"--config-file=" + QString::fromStdString(_place / "bus.conf"), "--nofork",
                                      "--print-address=1"});
        if (_daemon.waitForReadyRead())
            _address = QString::fromUtf8(_daemon.readLine()).trimmed();
    }
    ~PrivateBus()
    {
        _daemon.terminate();
        _daemon.waitForFinished();
    }

    /// A named connection of this process. It lasts until it is disconnected by that name.
    QDBusConnection connect(const QString& name) const { return QDBusConnection::connectToBus(_address, name); }

    /// What DBUS_SYSTEM_BUS_ADDRESS or DBUS_SESSION_BUS_ADDRESS has to be.
    std::string address() const { return _address.toStdString(); }
    /// Ends the bus, as a crash does.
    void kill()
    {
        _daemon.kill();
        _daemon.waitForFinished();
    }

private:
    ScratchDirectory _place;
    QProcess _daemon;
    QString _address;
};

} // namespace kestrum
