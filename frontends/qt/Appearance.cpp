#include "frontends/qt/Appearance.h"

#include "frontends/qt/Colours.h"
#include "frontends/qt/Motion.h"

#include <QApplication>
#include <QDBusError>
#include <QDBusMessage>
#include <QDBusPendingCallWatcher>
#include <QDBusPendingReply>
#include <QDBusServiceWatcher>
#include <QFile>
#include <QToolTip>

namespace kestrum::qt {

namespace {

const QString kPortal = QStringLiteral("org.freedesktop.portal.Desktop");
const QString kPath = QStringLiteral("/org/freedesktop/portal/desktop");
const QString kSettings = QStringLiteral("org.freedesktop.portal.Settings");
const QString kSchemeGroup = QStringLiteral("org.freedesktop.appearance"), kScheme = QStringLiteral("color-scheme");
const QString kMotionGroup = QStringLiteral("org.gnome.desktop.interface"),
              kMotion = QStringLiteral("enable-animations");

} // namespace

QDBusConnection desktopBus()
{
    // Without a session bus, Qt would try to start one.
    if (!qEnvironmentVariableIsSet("DBUS_SESSION_BUS_ADDRESS") &&
        !QFile::exists(qEnvironmentVariable("XDG_RUNTIME_DIR") + QStringLiteral("/bus")))
        return QDBusConnection(QString());
    return QDBusConnection::sessionBus();
}

Appearance::Appearance(const QDBusConnection& bus) : _bus(bus)
{
    qApp->installEventFilter(this);
    applyScheme();
    if (!_bus.isConnected())
        return;
    // Qt finds the slot by its type names. It knows this type only after it is registered.
    qRegisterMetaType<QDBusVariant>();
    if (!_bus.connect(kPortal, kPath, kSettings, QStringLiteral("SettingChanged"), this,
                      SLOT(settingChanged(QString, QString, QDBusVariant))))
        qWarning("kestrum: cannot follow changes of the desktop's settings: %s",
                 qPrintable(_bus.lastError().message()));
    // A portal that starts later, or restarts, may give another value.
    auto* portal = new QDBusServiceWatcher(kPortal, _bus, QDBusServiceWatcher::WatchForRegistration, this);
    connect(portal, &QDBusServiceWatcher::serviceRegistered, this, &Appearance::askAll);
    askAll();
}

void Appearance::askAll()
{
    ask(kSchemeGroup, kScheme);
    ask(kMotionGroup, kMotion);
}

void Appearance::ask(const QString& group, const QString& key)
{
    QDBusMessage read = QDBusMessage::createMethodCall(kPortal, kPath, kSettings, QStringLiteral("Read"));
    read << group << key;
    auto* watcher = new QDBusPendingCallWatcher(_bus.asyncCall(read), this);
    connect(watcher, &QDBusPendingCallWatcher::finished, this, [this, group, key, watcher] {
        const QDBusPendingReply<QDBusVariant> reply = *watcher;
        if (!reply.isError()) // there is no portal, or the portal does not know this setting
            settingChanged(group, key, reply.value());
        watcher->deleteLater();
    });
}

void Appearance::settingChanged(const QString& group, const QString& key, const QDBusVariant& value)
{
    QVariant plain = value.variant();
    while (plain.canConvert<QDBusVariant>()) // "Read" wraps its reply once more than the signal does
        plain = plain.value<QDBusVariant>().variant();
    if (group == kSchemeGroup && key == kScheme) {
        constexpr uint kPreferDark = 1, kPreferLight = 2;
        const uint preference = plain.toUInt();
        _dark.reset();
        if (preference == kPreferDark || preference == kPreferLight)
            _dark = preference == kPreferDark;
        applyScheme();
    } else if (group == kMotionGroup && key == kMotion) {
        setMotionWanted(plain.toBool());
    }
}

bool Appearance::eventFilter(QObject* watched, QEvent* event)
{
    if (event->type() == QEvent::ThemeChange && !_applying)
        applyScheme();
    return QObject::eventFilter(watched, event);
}

void Appearance::applyScheme()
{
    _applying = true;
    QApplication::setPalette(QPalette()); // restores the theme's palette
    const bool dark = _dark.value_or(isDark(QApplication::palette()));
    const QPalette palette = paletteOf(dark ? darkColours() : lightColours());
    QApplication::setPalette(palette);
    QToolTip::setPalette(palette);
    _applying = false;
}

} // namespace kestrum::qt
