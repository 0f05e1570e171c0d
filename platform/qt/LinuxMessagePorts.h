#pragma once

#include "platform/MessagePorts.h"
#include "support/Problem.h"

#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>

namespace kestrum {

class SystemLog;

/// Message ports on Unix-domain sockets in one directory, which only this user can access.
class LinuxMessagePorts final : public MessagePorts {
public:
    /// Invalidation handlers run on `queue`. Queue and log are borrowed and outlive the ports.
    LinuxMessagePorts(std::string directory, MainQueue& queue, SystemLog& log);

    /// The address is the name and this process's number. Null, with a log line, when the address is taken.
    std::unique_ptr<LocalPort> createLocal(std::string_view name, ReceiveHandler handler) override;
    /// `name` is an address that the telephony service gave.
    std::unique_ptr<RemotePort> createRemote(std::string_view name) override;

    /// Whether messages can reach a local port of this name.
    bool isListening(std::string_view name) const;
    /// Why the last local port could not be created; nothing after success.
    const std::optional<Problem>& problem() const { return _problem; }

private:
    std::string _directory;
    MainQueue& _queue;
    SystemLog& _log;
    std::map<std::string, std::weak_ptr<const void>, std::less<>> _listening; // by name
    std::optional<Problem> _problem;
};

} // namespace kestrum
