#pragma once

#include "platform/posix/Frame.h"
#include "voxd/Source.h"

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

class FrameConnection;
class SystemLog;

/// Faults of the service, for tests of displays. Each fault occurs a few times or lasts some seconds. The service may
/// block during a fault; afterwards it works as usual.
class Faults {
public:
    /// The help text: one line per fault.
    static std::string help();
    static bool exists(std::string_view name);

    /// The names must exist. Each occurrence and the end of each fault are logged.
    Faults(const std::vector<std::string>& names, SystemLog& log);
    ~Faults();

    /// Sends the frame, or causes a fault instead. False when the connection is closed.
    bool send(FrameConnection& connection, const Frame& frame);
    /// `source` with the requested changes of technology. Null when none were requested. `source` must outlive the
    /// result.
    std::unique_ptr<Source> unsteady(Source& source);

private:
    struct Fault;

    static const std::vector<Fault>& all();
    void strike(const Fault& fault, FrameConnection& connection, const Frame& frame);

    SystemLog& _log;
    std::vector<Fault> _pending;
    std::size_t _logMessages = 0; // since the last reply about the technology
};

} // namespace kestrum
