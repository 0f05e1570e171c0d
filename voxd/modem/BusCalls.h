#pragma once

#include <QDBusConnection>
#include <QDBusMessage>
#include <QString>
#include <QVariantList>

#include <chrono>
#include <functional>
#include <list>
#include <memory>

class QDBusPendingCallWatcher;

namespace kestrum {

/// Calls of methods of ModemManager that wait for their replies. Their end cancels the replies. Time is counted in
/// the owner's ticks, one a second.
class BusCalls {
public:
    /// Gets the reply or an error.
    using Done = std::function<void(const QDBusMessage& reply)>;

    explicit BusCalls(QDBusConnection bus);
    BusCalls(const BusCalls&) = delete;
    BusCalls& operator=(const BusCalls&) = delete;
    ~BusCalls();

    /// Calls `done` once, never within this call: with the reply, or after `limit` with the error kNoReply. `done` must
    /// not destroy this object.
    void call(const QString& path, const QString& interface, const QString& method, const QVariantList& arguments,
              std::chrono::seconds limit, Done done);
    /// A method of any program on the bus.
    void call(const QDBusMessage& method, std::chrono::seconds limit, Done done);
    void tick();

    bool isEmpty() const { return _calls.empty(); }

private:
    struct Call;
    using Calls = std::list<Call>;

    void finish(Calls::iterator call, const QDBusMessage& reply);

    QDBusConnection _bus;
    Calls _calls;
};

} // namespace kestrum
