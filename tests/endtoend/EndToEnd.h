#pragma once

#include "harness/Places.h"
#include "harness/QtTestToolkit.h"
#include "harness/Scratch.h"
#include "qtplatform/EventLoop.h"

#include <QProcess>
#include <gmock/gmock.h>

#include <filesystem>
#include <string>

namespace kestrum {

/// A device for the test, with the real telephony service on it.
class EndToEnd : public testing::Test {
protected:
    EndToEnd()
    {
        std::filesystem::create_directories(directory / "device");
        std::filesystem::create_directories(runtime());
        std::filesystem::permissions(runtime(), std::filesystem::perms::owner_all);
    }
    ~EndToEnd() override { killService(); }

    std::string runtime() const { return directory / "run"; }

    /// Waits until the service accepts clients.
    bool startService(const QStringList& arguments = {"--scenario", "ifx"})
    {
        service.start(QString::fromStdString(builtProgram("voxd")), arguments);
        return eventually([&] { return service.canReadLine(); });
    }
    void killService()
    {
        service.kill();
        service.waitForFinished();
    }

    ScratchDirectory directory;
    // For this process and those that it starts.
    ScopedVariable runtimeVariable{"KESTRUM_RUNTIME_DIR", runtime()};
    ScopedVariable deviceVariable{"KESTRUM_DEVICE_ROOT", directory / "device"};
    ScopedVariable configurationVariable{"XDG_CONFIG_HOME", directory / "config"};
    QProcess service;
};

} // namespace kestrum
