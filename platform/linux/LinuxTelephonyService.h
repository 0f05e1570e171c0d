#pragma once

#include "platform/TelephonyService.h"

#include <string>

namespace kestrum {

class MainQueue;
class SystemLog;

/// The telephony service that listens in the runtime directory: voxd, or another one that speaks its protocol.
class LinuxTelephonyService final : public TelephonyService {
public:
    /// Notifications are handed over on `queue`. Both outlive the connections.
    LinuxTelephonyService(std::string directory, MainQueue& queue, SystemLog& log);

    std::unique_ptr<VoxServerConnection> connect(NotificationHandler handler) override;

private:
    std::string _directory;
    MainQueue& _queue;
    SystemLog& _log;
};

} // namespace kestrum
