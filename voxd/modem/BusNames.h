#pragma once

#include <QString>

/// Names of ModemManager on the system bus.
namespace kestrum::bus {

inline const QString kService = QStringLiteral("org.freedesktop.ModemManager1");
inline const QString kManagerPath = QStringLiteral("/org/freedesktop/ModemManager1");
inline const QString kModemPaths = QStringLiteral("/org/freedesktop/ModemManager1/Modem/");

inline const QString kManager = kService;
inline const QString kModem = QStringLiteral("org.freedesktop.ModemManager1.Modem");
inline const QString kModem3gpp = QStringLiteral("org.freedesktop.ModemManager1.Modem.Modem3gpp");
inline const QString kSignal = QStringLiteral("org.freedesktop.ModemManager1.Modem.Signal");
inline const QString kLocation = QStringLiteral("org.freedesktop.ModemManager1.Modem.Location");
inline const QString kSim = QStringLiteral("org.freedesktop.ModemManager1.Sim");
inline const QString kBearer = QStringLiteral("org.freedesktop.ModemManager1.Bearer");
inline const QString kObjectManager = QStringLiteral("org.freedesktop.DBus.ObjectManager");
inline const QString kProperties = QStringLiteral("org.freedesktop.DBus.Properties");

inline const QString kAccessDenied = QStringLiteral("org.freedesktop.DBus.Error.AccessDenied");
inline const QString kNoReply = QStringLiteral("org.freedesktop.DBus.Error.NoReply");

} // namespace kestrum::bus
