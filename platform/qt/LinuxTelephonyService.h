#pragma once

#include "platform/TelephonyService.h"

#include <string>

namespace kestrum {

class LinuxMessagePorts;
class MainQueue;
class SystemLog;

/// Connects to the telephony service in the runtime directory: voxd, or another service with the same protocol.
class LinuxTelephonyService final : public TelephonyService {
public:
    /// Notifications are delivered on `queue`. A log channel is requested only when one of `ports` listens for it. All
    /// three are borrowed and outlive the connections.
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
