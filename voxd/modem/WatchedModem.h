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
#include <vector>

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
    /// A setting of the daemon: theirs, ours while it is needed, and then theirs again.
    struct Setting {
        enum class Phase { Theirs, Taking, Ours, Returning };

        ModemService service;
        QString interface;
        Phase phase = Phase::Theirs;
    };
    /// An object that belongs to the modem, and what is known of it.
    template <typename Known>
    struct Part {
        QString path;
        std::optional<Known> known = {};
        bool isAsked = false;
    };
    /// Properties of an interface: all of them, or those that have changed.
    struct Properties {
        const QVariantMap& values;
        bool all;

        /// Calls `use` with the value, unless it has not changed.
        template <typename Use>
        void with(const char* name, Use use) const;
        template <typename Target, typename Reader>
        void read(const char* name, Target& target, Reader reader) const;
    };

    void readInterface(const QString& interface, const Properties& properties);
    void readModem(const Properties& properties);
    void readQuality(const QVariant& value);
    void read3gpp(const Properties& properties);
    void readSignal(const Properties& properties);
    void readLocationSettings(const Properties& properties);
    static void readSim(const Properties& properties, ModemSim& sim);
    static void readBearer(const Properties& properties, ModemBearer& bearer);

    void followSim(const QString& path);
    void followBearers(const QList<QDBusObjectPath>& paths);
    void fetchParts();
    template <typename Known>
    void fetch(Part<Known>* (WatchedModem::*find)(const QString&), Part<Known>& part, const QString& interface,
               ModemService service, void (*read)(const Properties&, Known&));
    Part<ModemSim>* findSim(const QString& path);
    Part<ModemBearer>* findBearer(const QString& path);
    void publishParts();

    bool isMeasurable() const;
    void settle();
    void settleRate();
    void settleLocation();
    void take(Setting& setting, const QVariantList& arguments, std::function<void()> taken);
    void putBack(Setting& setting, const QVariantList& arguments, std::function<void()> returned);
    void askLocation();
    void askCells();
    void takeCells(const QDBusMessage& reply);

    bool mayAsk(ModemService service) const;
    void refuse(ModemService service, const QDBusMessage& error);
    void refuse(const ModemRefusal& refusal);
    void permit(ModemService service);

    QString _path;
    unsigned _number;
    SystemLog& _log;
    std::function<void()> _changed;
    BusCalls _calls;
    ModemState _state;

    QStringList _interfaces;
    Part<ModemSim> _sim;
    std::vector<Part<ModemBearer>> _bearers;

    bool _measuring = false;
    Setting _rateSetting, _locationSetting;
    std::uint32_t _rate = 0, _rateBefore = 0; ///< seconds; 0: levels are not measured
    std::uint32_t _locationSources = 0, _locationCapabilities = 0;
    bool _signalsLocation = false;
    bool _locationIsAsked = false;
    std::optional<std::chrono::seconds> _cellsAwaited; ///< for so long
    std::chrono::seconds _now{0};                      ///< ticks
    std::chrono::seconds _nextLocation{0}, _nextCells{0};
    std::map<ModemService, std::chrono::seconds> _askAgain; ///< the refused, and when they are asked again
};

} // namespace kestrum
