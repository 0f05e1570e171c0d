#pragma once

#include "platform/TelephonyService.h"

#include <string>

namespace kestrum {

class LinuxMessagePorts;
class MainQueue;
class SystemLog;

/// The telephony service that listens in the runtime directory: voxd, or another one that speaks its protocol.
class LinuxTelephonyService final : public TelephonyService {
public:
    /// Notifications are handed over on `queue`. A log channel is asked for only when one of `ports` listens for it.
    /// All outlive the connections.
    LinuxTelephonyService(std::string directory, const LinuxMessagePorts& ports, MainQueue& queue, SystemLog& log);

    std::unique_ptr<VoxServerConnection> connect(NotificationHandler handler) override;
    std::optional<Problem> problem() const override { return _problem; }

private:
    std::string _directory;
    const LinuxMessagePorts& _ports;
    MainQueue& _queue;
    SystemLog& _log;
    std::optional<Problem> _problem;
};

} // namespace kestrum
