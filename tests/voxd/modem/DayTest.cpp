#include "ModemFixture.h"

#include "platform/propertylist/PropertyListCodec.h"
#include "voxd/modem/ModemSource.h"

#include <fstream>

#include <unistd.h>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using Fake = FakeModemManager;

std::size_t residentBytes()
{
    std::ifstream file("/proc/self/statm");
    std::size_t total = 0, resident = 0;
    file >> total >> resident;
    return resident * static_cast<std::size_t>(::sysconf(_SC_PAGESIZE));
}

class ADay : public ModemManagerTest {
protected:
    ADay()
    {
        log.onWrite = [this](std::string_view) { log.lines.clear(); };
        source.available = [this] { take(); };
        startDaemon();
    }
    void startDaemon()
    {
        daemon.reset();
        daemon = std::make_unique<Fake>(bus);
        daemon->remembers = false;
        daemon->cells = QList<QVariantMap>(12, {{"cell-type", 5U}, {"physical-ci", "7B"}, {"rsrp", -99.0}});
    }
    void take()
    {
        while (source.next())
            ++trees;
    }
    // Shorter than the limit of any call, so that the daemon answers in time.
    void pass(std::chrono::minutes time, const QString& path = {})
    {
        constexpr auto kStep = 3s;
        for (auto now = 0s; now < time; now += kStep) {
            if (!path.isEmpty())
                daemon->set(path, Fake::kSignal, {{"Lte", QVariantMap{{"rsrp", -80.0 - double(now.count() % 40)}}}});
            queue.advance(kStep);
            settle();
        }
    }

    PropertyListCodec lists;
    ModemSource source{client, {}, queue, clock, lists};
    std::size_t trees = 0;
};

TEST_F(ADay, WithAModemThatComesAndGoesTakesNoMemoryAndLeavesNothingSetUp)
{
    std::size_t early = 0;
    QString path;
    for (int hour = 0; hour < 24; ++hour) {
        if (hour % 6 == 5)
            startDaemon();
        source.streamedTo(1);
        path = daemon->plugIn(Fake::modem("abcd"));
        ASSERT_TRUE(measures(path)) << hour;
        pass(5min, path);
        ASSERT_TRUE(modem().signal.lte && modem().location) << hour;
        ASSERT_EQ(modem().number, 1U);
        if (hour % 2 == 0) {
            daemon->unplug(path);
            pass(5min);
            ASSERT_TRUE(client.states().modems.empty());
        }
        source.streamedTo(0);
        ASSERT_TRUE(eventually([&] { return client.isAtRest(); }));
        if (hour % 2 == 1) {
            ASSERT_EQ(daemon->rate(path), 0U) << hour;
            ASSERT_EQ(daemon->sources(path), 0U) << hour;
            daemon->unplug(path);
        }
        settle();
        queue.advance(hour % 2 == 0 ? 50min : 55min); // without a display nothing is due
        ASSERT_EQ(queue.timers(), 0U);
        ASSERT_EQ(queue.tasks(), 0U);
        if (hour == 3)
            early = residentBytes();
    }
    EXPECT_GT(trees, 24U * 5 * 20);
    RecordProperty("grown", static_cast<int>(residentBytes() - early));
    EXPECT_LT(residentBytes(), early + (std::size_t{4} << 20));
}

} // namespace
} // namespace kestrum
