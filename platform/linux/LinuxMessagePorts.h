#pragma once

#include "platform/MessagePorts.h"

#include <string>

namespace kestrum {

class SystemLog;

/// Message ports on Unix-domain sockets in one directory, which is this user's alone.
class LinuxMessagePorts final : public MessagePorts {
public:
    /// Invalidation handlers run on `queue`. Both outlive the ports.
    LinuxMessagePorts(std::string directory, MainQueue& queue, SystemLog& log);

    /// The address is the name and this process's number. Null, with a log line, when it is taken.
    std::unique_ptr<LocalPort> createLocal(std::string_view name, ReceiveHandler handler) override;
    /// `name` is an address as the telephony service gives it.
    std::unique_ptr<RemotePort> createRemote(std::string_view name) override;

private:
    std::string _directory;
    MainQueue& _queue;
    SystemLog& _log;
};

} // namespace kestrum
