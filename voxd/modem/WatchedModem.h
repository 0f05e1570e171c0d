#pragma once

#include "voxd/modem/BusCalls.h"
#include "voxd/modem/BusValue.h"
#include "voxd/modem/ModemState.h"

#include <QDBusConnection>
#include <QString>
#include <QStringList>

#include <chrono>
#include <functional>
#include <map>
#include <optional>
#include <string_view>

namespace kestrum {

class SystemLog;

/// A modem of ModemManager: follows its properties, and while it measures has the daemon measure levels and cells.
/// What it set up for that it puts back afterwards. Each refusal is logged once.
class WatchedModem {
public:
    /// `changed` is called when the state may have changed. It must not destroy this object.
    WatchedModem(const QDBusConnection& bus, const QString& path, const BusInterfaces& interfaces, SystemLog& log,
                 std::function<void()> changed);

    const ModemState& state() const { return _state; }
    /// The number at the end of its path. A modem that comes again has a greater one.
    unsigned number() const { return _number; }

    /// All interfaces of the modem with all their properties.
    void setInterfaces(const BusInterfaces& interfaces);
    /// Interfaces that were added.
    void addInterfaces(const BusInterfaces& interfaces);
    void removeInterfaces(const QStringList& names);
    /// A change of properties of the modem, of its SIM or of a bearer; others are ignored.
    void changeProperties(const QString& path, const QString& interface, QVariantMap changed,
                          const QStringList& invalidated);
    /// The daemon does not answer: what was measured may be of long ago, and is unknown now.
    void forgetMeasurements();

    void setMeasuring(bool measuring);
    /// Whether the daemon's settings are as they were, and no call waits for its reply.
    bool isAtRest() const;
    /// Call it every second.
    void tick();

private:
    /// A setting of the daemon: as it was before, ours while it is needed, and put back then.
    struct Setting {
        enum class Phase { Theirs, Taking, Ours, Returning };
        Phase phase = Phase::Theirs;

        bool isOurs() const { return phase == Phase::Taking || phase == Phase::Ours; }
    };
    using Properties = QVariantMap;

    void readModem(const Properties& properties);
    void read3gpp(const Properties& properties);
    void readSignal(const Properties& properties);
    void readLocationSettings(const Properties& properties);
    void readSim(const Properties& properties);
    void followSim(const QString& path);
    void followBearers(const QList<QDBusObjectPath>& paths);
    void fetch(const QString& path, const QString& interface, ModemService service,
               std::function<void(const Properties&)> read);

    bool isMeasurable() const;
    void settle();
    void settleRate();
    void settleLocation();
    void change(Setting& setting, ModemService service, const QString& interface, const QVariantList& arguments,
                std::function<void()> taken);
    void putBack(Setting& setting, const QString& interface, const QVariantList& arguments);
    void askLocation();
    void askCells();
    void readCells(const QDBusMessage& reply);

    bool mayAsk(ModemService service) const;
    void refuse(ModemService service, const QDBusMessage& error);
    void refuse(ModemRefusal refusal);
    void permit(ModemService service);

    QString _path;
    unsigned _number;
    SystemLog& _log;
    std::function<void()> _changed;
    BusCalls _calls;
    ModemState _state;

    BusInterfaces _interfaces; ///< the names; the properties are empty
    QString _simPath;
    std::map<QString, std::optional<ModemBearer>> _bearers; ///< by path; empty until it has been read

    bool _measuring = false;
    Setting _rateSetting, _locationSetting;
    std::uint32_t _rate = 0, _rateBefore = 0;
    std::uint32_t _locationSources = 0, _locationCapabilities = 0;
    bool _signalsLocation = false;
    bool _locationAsked = false;
    std::optional<std::chrono::seconds> _cellsAskedFor; ///< how long the reply has been awaited
    std::chrono::seconds _now{0};                       ///< ticks
    std::chrono::seconds _nextLocation{0}, _nextCells{0};
    std::map<ModemService, std::chrono::seconds> _askAgain; ///< not before; for those that were refused
};

} // namespace kestrum
