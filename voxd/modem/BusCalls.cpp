#include "voxd/modem/BusCalls.h"

#include "voxd/modem/BusNames.h"

#include <QDBusError>
#include <QDBusPendingCallWatcher>

#include <utility>

namespace kestrum {
namespace {

// The bus library has a limit too, which must not come before the owner's.
constexpr std::chrono::seconds kSpare{2};

} // namespace

struct BusCalls::Call {
    std::unique_ptr<QDBusPendingCallWatcher> watcher;
    std::chrono::seconds left;
    Done done;
};

BusCalls::BusCalls(QDBusConnection bus) : _bus(std::move(bus)) {}

BusCalls::~BusCalls() = default;

void BusCalls::call(const QString& path, const QString& interface, const QString& method, const QVariantList& arguments,
                    std::chrono::seconds limit, Done done)
{
    auto message = QDBusMessage::createMethodCall(bus::kService, path, interface, method);
    message.setArguments(arguments);
    message.setAutoStartService(false);
    call(message, limit, std::move(done));
}

void BusCalls::call(const QDBusMessage& method, std::chrono::seconds limit, Done done)
{
    const auto milliseconds = static_cast<int>(std::chrono::milliseconds(limit + kSpare).count());
    const auto call = _calls.insert(_calls.end(), Call{});
    call->left = limit;
    call->done = std::move(done);
    call->watcher.reset(new QDBusPendingCallWatcher(_bus.asyncCall(method, milliseconds)));
    QObject::connect(call->watcher.get(), &QDBusPendingCallWatcher::finished, call->watcher.get(),
                     [this, call](QDBusPendingCallWatcher* watcher) { finish(call, watcher->reply()); });
}

void BusCalls::tick()
{
    Calls late;
    for (auto each = _calls.begin(); each != _calls.end();) {
        const auto call = each++;
        call->left -= std::chrono::seconds(1);
        if (call->left > std::chrono::seconds(0))
            continue;
        call->watcher.reset();
        late.splice(late.end(), _calls, call);
    }
    for (const auto& each : late)
        each.done(QDBusMessage::createError(bus::kNoReply, QString()));
}

// Taken out first: `done` may make the next call.
void BusCalls::finish(Calls::iterator call, const QDBusMessage& reply)
{
    Call finished = std::move(*call);
    _calls.erase(call);
    finished.watcher.release()->deleteLater(); // this runs in its signal
    finished.done(reply);
}

} // namespace kestrum
