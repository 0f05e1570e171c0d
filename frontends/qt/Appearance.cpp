#include "frontends/qt/Appearance.h"

#include "frontends/qt/Colours.h"
#include "frontends/qt/Motion.h"

#include <QApplication>
#include <QDBusConnection>
#include <QDBusMessage>
#include <QDBusPendingCallWatcher>
#include <QDBusPendingReply>
#include <QFile>

namespace kestrum::qt {

namespace {

const QString kPortal = QStringLiteral("org.freedesktop.portal.Desktop");
const QString kPath = QStringLiteral("/org/freedesktop/portal/desktop");
const QString kSettings = QStringLiteral("org.freedesktop.portal.Settings");
const QString kSchemeGroup = QStringLiteral("org.freedesktop.appearance"), kScheme = QStringLiteral("color-scheme");
const QString kMotionGroup = QStringLiteral("org.gnome.desktop.interface"),
              kMotion = QStringLiteral("enable-animations");

} // namespace

Appearance::Appearance()
{
    qApp->installEventFilter(this);
    applyScheme();
    // Where no session bus runs, Qt would try to start one.
    if (!qEnvironmentVariableIsSet("DBUS_SESSION_BUS_ADDRESS") &&
        !QFile::exists(qEnvironmentVariable("XDG_RUNTIME_DIR") + QStringLiteral("/bus")))
        return;
    QDBusConnection bus = QDBusConnection::sessionBus();
    if (!bus.isConnected())
        return;
    bus.connect(kPortal, kPath, kSettings, QStringLiteral("SettingChanged"), this,
                SLOT(settingChanged(QString, QString, QDBusVariant)));
    ask(kSchemeGroup, kScheme);
    ask(kMotionGroup, kMotion);
}

void Appearance::ask(const QString& group, const QString& key)
{
    QDBusMessage read = QDBusMessage::createMethodCall(kPortal, kPath, kSettings, QStringLiteral("Read"));
    read << group << key;
    auto* watcher = new QDBusPendingCallWatcher(QDBusConnection::sessionBus().asyncCall(read), this);
    connect(watcher, &QDBusPendingCallWatcher::finished, this, [this, group, key, watcher] {
        const QDBusPendingReply<QDBusVariant> reply = *watcher;
        if (!reply.isError()) // no portal, or none that knows this setting
            settingChanged(group, key, reply.value());
        watcher->deleteLater();
    });
}

void Appearance::settingChanged(const QString& group, const QString& key, const QDBusVariant& value)
{
    QVariant plain = value.variant();
    while (plain.canConvert<QDBusVariant>()) // "Read" wraps its answer once more than the signal does
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
    QApplication::setPalette(QPalette()); // brings the theme's own palette back
    const bool dark = _dark.value_or(isDark(QApplication::palette()));
    QApplication::setPalette(paletteOf(dark ? darkColours() : lightColours()));
    _applying = false;
}

} // namespace kestrum::qt
