#pragma once

#include <QDBusConnection>
#include <QDBusVariant>
#include <QObject>
#include <optional>

namespace kestrum::qt {

/// The bus that gives access to the desktop's settings. Not connected where there is no such bus.
QDBusConnection desktopBus();

/// Follows the desktop's light or dark scheme, and its setting for reduced motion, as long as this object exists. It
/// listens to Qt's platform theme and, where one runs, to the settings portal (org.freedesktop.portal.Settings).
class Appearance final : public QObject {
    Q_OBJECT

public:
    explicit Appearance(const QDBusConnection& bus = desktopBus());

    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    Q_SLOT void settingChanged(const QString& group, const QString& key, const QDBusVariant& value);
    void askAll();
    void ask(const QString& group, const QString& key);
    void applyScheme();

    QDBusConnection _bus;
    std::optional<bool> _dark; ///< the portal's value; empty when the portal leaves the scheme to the theme
    bool _applying = false;
};

} // namespace kestrum::qt
