#include "platform/qt/LinuxDevice.h"
#include "harness/Scratch.h"
#include "platform/Console.h"
#include "platform/MainQueue.h"
#include "platform/SystemLog.h"
#include "platform/qt/TerminationSignals.h"
#include "qtplatform/EventLoop.h"

#include <gtest/gtest.h>

#include <csignal>

namespace kestrum {
namespace {

class TerminationSignal : public testing::TestWithParam<int> {};

TEST_P(TerminationSignal, RunsTheActionFromTheEventLoop)
{
    int runs = 0;
    const TerminationSignals watch([&] { ++runs; });
    ::raise(GetParam());
    ::raise(GetParam());
    EXPECT_EQ(runs, 0);
    ASSERT_TRUE(eventually([&] { return runs > 0; }));
    EXPECT_EQ(runs, 1);
}

INSTANTIATE_TEST_SUITE_P(TerminationSignals, TerminationSignal, testing::Values(SIGTERM, SIGINT, SIGHUP),
                         [](const auto& each) { return std::string("Signal") + std::to_string(each.param); });

TEST(LinuxDevice, YieldsTheRolesAndDropsWhatIsQueued)
{
    const ScratchDirectory directory;
    const ScopedVariable runtime("KESTRUM_RUNTIME_DIR", directory.path());
    LinuxDevice device("tests", LinuxDevice::Output::Quiet);
    const auto roles = device.monitorRoles();
    EXPECT_FALSE(roles.console.isDebugWatched());
    const auto held = std::make_shared<int>(0);
    roles.queue.post([held] { ++*held; });
    device.dropQueued();
    EXPECT_EQ(held.use_count(), 1);
    bool ran = false;
    roles.queue.post([&] { ran = true; });
    EXPECT_TRUE(eventually([&] { return ran; }));
}

TEST(LinuxDevice, LogsErrorsAloneUnlessKestrumLogAllowsMore)
{
    const ScratchDirectory directory;
    const ScopedVariable runtime("KESTRUM_RUNTIME_DIR", directory.path());
    const auto passes = [](Priority priority, std::optional<std::string> level) {
        const ScopedVariable variable("KESTRUM_LOG", std::move(level));
        LinuxDevice device("tests", LinuxDevice::Output::Quiet);
        return device.monitorRoles().log.passes(priority);
    };
    EXPECT_TRUE(passes(Priority::Error, std::nullopt));
    EXPECT_FALSE(passes(Priority::Warning, std::nullopt));
    EXPECT_FALSE(passes(Priority::Raw16, std::nullopt));
    EXPECT_TRUE(passes(Priority::Warning, "warning"));
    EXPECT_FALSE(passes(Priority::Raw16, "warning"));
    EXPECT_TRUE(passes(Priority::Raw16, "notice"));
}

} // namespace
} // namespace kestrum
