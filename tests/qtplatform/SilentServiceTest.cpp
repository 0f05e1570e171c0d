// The model on real sockets, with a service that takes the request for a log channel but never answers.
#include "core/KestrumModel.h"
#include "doubles/DecodingDoubles.h"
#include "harness/Scratch.h"
#include "platform/qt/LinuxMessagePorts.h"
#include "platform/qt/LinuxTelephonyService.h"
#include "platform/qt/QtMainQueue.h"
#include "posix/RawSocket.h"
#include "qtplatform/EventLoop.h"

#include <gmock/gmock.h>

namespace kestrum {
namespace {

using namespace std::chrono_literals;
using testing::ElementsAre;

constexpr const char* kLogPort = "org.kestrum.vox.baseband-state-report.log";
constexpr const char* kInVain = "Could not create the ports necessary";

class SilentService : public testing::Test, protected DecodingDoubles {
protected:
    ~SilentService() override { queue.clear(); }

    ScratchDirectory directory;
    QtMainQueue queue;
    LinuxMessagePorts ports{directory.path(), queue, log};
    LinuxTelephonyService telephony{directory.path(), ports, queue, log};
    MonitorRoles monitorRoles{roles, queue, ports, telephony};
    std::shared_ptr<KestrumModel> model = std::make_shared<KestrumModel>(monitorRoles);
    RawSocket listening = RawSocket::listenAt(directory / "org.kestrum.vox");
};

TEST_F(SilentService, LeavesTheMainLoopTurning)
{
    int turns = 0, keys = 0;
    QTimer loop, key;
    QObject::connect(&loop, &QTimer::timeout, [&] { ++turns; });
    loop.start(0);
    key.singleShot(10ms, [&] { ++keys; });
    model->startMonitor();
    EXPECT_GT(turns, 10);
    EXPECT_EQ(keys, 1);
    EXPECT_EQ(model->connectionProblem(), Problem{"The telephony service does not answer."});
    EXPECT_FALSE(ports.isListening(kLogPort));
}

TEST_F(SilentService, MayLoseTheChannelInTheWait)
{
    queue.post([&] { model->destroyPorts(); });
    model->startMonitor();
    EXPECT_THAT(log.errors(),
                ElementsAre("_VoxServerConnectionNetworkMonitorCreateLogChannel returns error: 110!", kInVain));
    EXPECT_FALSE(model->isConnected());
    EXPECT_FALSE(ports.isListening(kLogPort));
}

TEST_F(SilentService, MayLoseTheModelsOwnerInTheWait)
{
    const std::weak_ptr<KestrumModel> watched = model;
    queue.post([&] { model.reset(); });
    model->startMonitor();
    EXPECT_FALSE(watched.expired()) << "the retry holds it";
    EXPECT_EQ(log.errors().back(), kInVain);
    queue.clear();
    EXPECT_TRUE(watched.expired());
    EXPECT_FALSE(ports.isListening(kLogPort));
}

TEST_F(SilentService, MayLoseTheOwnerOfAModelThatOnlyCreatesPorts)
{
    const std::weak_ptr<KestrumModel> watched = model;
    queue.post([&] { model.reset(); });
    EXPECT_FALSE(model->createPorts());
    EXPECT_TRUE(watched.expired());
    EXPECT_FALSE(ports.isListening(kLogPort));
}

} // namespace
} // namespace kestrum
