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

/// Faults of the service, for tests of displays against them. Each fault strikes a few times or for some seconds; the
/// service may stand still meanwhile and works as usual afterwards.
class Faults {
public:
    /// For the help text: a line for each fault.
    static std::string help();
    static bool exists(std::string_view name);

    /// The names must exist. Each strike, and the end of each fault, is logged.
    Faults(const std::vector<std::string>& names, SystemLog& log);
    ~Faults();

    /// Sends the frame, or strikes instead. False when the connection has closed.
    bool send(FrameConnection& connection, const Frame& frame);
    /// The source with the changes of technology that were asked for. Null when none were; `source` outlives it.
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
