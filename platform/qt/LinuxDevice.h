#pragma once

#include "platform/Roles.h"

#include <memory>
#include <string>

namespace kestrum {

/// All roles of the device but the toolkit, on Linux: what a program's main() makes once its Qt application object
/// stands. Make it before, and let it go after, whatever uses the roles.
class LinuxDevice {
public:
    enum class Output { Standard, Quiet }; ///< the console: standard output, or nothing

    /// `program` is the name in the system's log.
    explicit LinuxDevice(const std::string& program, Output output = Output::Standard);
    ~LinuxDevice();

    MonitorRoles monitorRoles();
    ApplicationRoles applicationRoles(Toolkit& toolkit);

    /// Drops queued tasks and timers, and so what they hold, while the ports and the log still stand: before the
    /// last owners of the model go.
    void dropQueued();

private:
    struct Adapters;
    std::unique_ptr<Adapters> _adapters;
};

} // namespace kestrum
