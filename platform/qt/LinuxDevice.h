#pragma once

#include "platform/Roles.h"

#include <memory>
#include <string>

namespace kestrum {

/// The adapters of all roles except the toolkit, on Linux. main() creates it after the Qt application object. It must
/// outlive everything that uses the roles.
class LinuxDevice {
public:
    enum class Output { Standard, Quiet }; ///< the console's; Quiet drops all lines

    /// `program` is the name in the system log.
    explicit LinuxDevice(const std::string& program, Output output = Output::Standard);
    ~LinuxDevice();

    MonitorRoles monitorRoles();
    ApplicationRoles applicationRoles(Toolkit& toolkit);

    /// Destroys the queued tasks and timers and the objects that they hold, such as the model. Call it before the
    /// destructor, while ports and log still exist.
    void dropQueued();

private:
    struct Adapters;
    std::unique_ptr<Adapters> _adapters;
};

} // namespace kestrum
