#pragma once

#include <QDBusConnection>
#include <QDBusVariant>
#include <QObject>
#include <optional>

namespace kestrum::qt {

/// The bus on which the desktop's settings are, not connected where there is none.
QDBusConnection desktopBus();

/// What the desktop asks of how things look: follows its light or dark scheme, and its wish for reduced motion, for as
/// long as this lives. It listens to Qt's platform theme and to the settings portal (org.freedesktop.portal.Settings)
/// where there is one.
class Appearance final : public QObject {
    Q_OBJECT

public:
    explicit Appearance(const QDBusConnection& bus = desktopBus());

    bool eventFilter(QObject* watched, QEvent* event) override;

private Q_SLOTS:
    void settingChanged(const QString& group, const QString& key, const QDBusVariant& value);

private:
    void askAll();
    void ask(const QString& group, const QString& key);
    void applyScheme();

    QDBusConnection _bus;
    std::optional<bool> _dark; ///< as the portal says; nothing when it leaves it to the theme
    bool _applying = false;
};

} // namespace kestrum::qt
