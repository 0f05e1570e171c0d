#pragma once

#include "FakeModemManager.h"

#include "doubles/CrankedQueue.h"
#include "doubles/RecordingLog.h"
#include "doubles/VirtualClock.h"
#include "qtplatform/EventLoop.h"
#include "voxd/modem/ModemManager.h"

#include <QDBusPendingCall>
#include <gmock/gmock.h>

namespace kestrum {

/// The client against a daemon on a bus of the test's, on a virtual clock.
class ModemManagerTest : public testing::Test {
protected:
    explicit ModemManagerTest(std::string choice = "first")
        : client([this](const QString& name) { return (nextBus ? *nextBus : bus).connect(name); }, std::move(choice),
                 queue, log)
    {}
    ~ModemManagerTest() override { QDBusConnection::disconnectFromBus("other"); }

    const ModemState& modem() const
    {
        static const ModemState none;
        return client.states().modems.empty() ? none : client.states().modems[0];
    }
    /// Turns the clock, second by second, and gives the daemon time to answer.
    void wait(std::chrono::seconds time)
    {
        for (; time > time.zero(); time -= std::chrono::seconds(1)) {
            queue.advance(std::chrono::seconds(1));
            settle();
        }
    }
    // A round trip through the bus and the daemon, until the client has nothing more to ask.
    void settle()
    {
        for (int quiet = 0; quiet < 2; ++quiet) {
            const auto asked = daemon->asked.size();
            const QDBusPendingCall round = other.asyncCall(
                QDBusMessage::createMethodCall(FakeModemManager::kService, "/", "org.kestrum.Test", "RoundTrip"));
            ASSERT_TRUE(eventually([&] { return round.isFinished(); }));
            if (daemon->asked.size() > asked)
                quiet = -1;
        }
    }
    bool measures(const QString& path)
    {
        const bool isSetUp = eventually([&] { return daemon->rate(path) == 1 && daemon->isLocating(path); });
        settle();
        return isSetUp;
    }

    PrivateBus bus;
    std::unique_ptr<PrivateBus> nextBus; ///< where the client connects to when `bus` has ended
    QDBusConnection other = bus.connect("other");
    std::unique_ptr<FakeModemManager> daemon = std::make_unique<FakeModemManager>(bus);
    VirtualClock clock;
    CrankedQueue queue{clock};
    RecordingLog log;
    ModemManager client;
};

} // namespace kestrum
