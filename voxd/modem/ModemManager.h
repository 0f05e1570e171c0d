#pragma once

#include "platform/MainQueue.h"
#include "voxd/modem/BusCalls.h"
#include "voxd/modem/ModemState.h"
#include "voxd/modem/WatchedModem.h"

#include <QDBusConnection>
#include <QDBusMessage>
#include <QObject>
#include <QString>

#include <chrono>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

class QDBusServiceWatcher;

namespace kestrum {

class SystemLog;

/// The daemon ModemManager on the system bus, and its modems. Nothing here blocks: what takes the daemon long arrives
/// later, and what takes it too long is given up.
class ModemManager final : public QObject {
    Q_OBJECT

public:
    /// Connects to the bus under a name for the connection.
    using Connect = std::function<QDBusConnection(const QString& name)>;
    static QDBusConnection systemBus(const QString& name);

    /// `choice`: "first", the modem that the daemon found first; "all"; or the beginning of a device identifier.
    /// The queue and the log must outlive this object.
    ModemManager(Connect connect, std::string choice, MainQueue& queue, SystemLog& log);
    ~ModemManager() override;

    const ModemStates& states() const { return _states; }
    /// Called when the states have changed.
    std::function<void()> changed = [] {};

    /// Has the daemon measure levels and cells of the chosen modems, or puts its settings back. Off at first.
    void setMeasuring(bool measuring);
    /// Whether all settings of the daemon are as they were.
    bool isAtRest() const;
    /// Stops measuring. Calls `done` once: as soon as the settings are put back, which may be now, or after `limit`.
    void end(std::chrono::seconds limit, std::function<void()> done);

private:
    using Modems = std::map<QString, std::unique_ptr<WatchedModem>>; ///< by path

    Q_SLOT void objectsAdded(const QDBusMessage& signal);
    Q_SLOT void objectsRemoved(const QDBusMessage& signal);
    Q_SLOT void propertiesChanged(const QDBusMessage& signal);

    void connectBus();
    void disconnectBus();
    void setOwner(const QString& owner);
    void setDaemon(ModemDaemon daemon);
    bool isFromDaemon(const QDBusMessage& signal, const char* signature) const;
    void askVersion();
    void list();
    void takeList(const QDBusMessage& reply);
    void takeObjects(const BusObjects& objects);
    void add(const QString& path, const BusInterfaces& interfaces);
    void remove(Modems::iterator modem);

    void tick();
    std::uint32_t lastingNumber(const std::string& identifier);
    bool isChosen(const WatchedModem& modem) const;
    void publish();
    void endIfAtRest();

    Connect _connect;
    std::string _choice;
    MainQueue& _queue;
    SystemLog& _log;
    std::optional<QDBusConnection> _bus;
    std::unique_ptr<QDBusServiceWatcher> _watcher;
    std::unique_ptr<BusCalls> _calls;
    QString _owner; ///< the daemon's unique name; empty while it is not on the bus
    Modems _modems;
    std::vector<std::string> _identifiers; ///< of all modems that were ever there
    ModemStates _states;
    bool _measuring = false, _ending = false;
    std::unique_ptr<Timer> _ticks;
    std::chrono::seconds _untilNext{0}; ///< until the next list, or the next attempt to connect
    std::chrono::seconds _untilEnd{0};
    std::function<void()> _ended;
};

} // namespace kestrum
