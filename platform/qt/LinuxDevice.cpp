#include "platform/qt/LinuxDevice.h"

#include "platform/posix/LinuxBundle.h"
#include "platform/posix/LinuxConsole.h"
#include "platform/posix/LinuxFileSystem.h"
#include "platform/posix/LinuxSystemLog.h"
#include "platform/posix/RuntimeDirectory.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "platform/qt/LinuxClock.h"
#include "platform/qt/LinuxMessagePorts.h"
#include "platform/qt/LinuxPreferences.h"
#include "platform/qt/LinuxTelephonyService.h"
#include "platform/qt/QtMainQueue.h"

namespace kestrum {

struct LinuxDevice::Adapters {
    Adapters(const std::string& program, Output output)
        : log(program),
          console(output == Output::Standard ? std::unique_ptr<Console>(std::make_unique<LinuxConsole>())
                                             : std::make_unique<QuietConsole>())
    {}

    LinuxSystemLog log;
    std::unique_ptr<Console> console;
    LinuxClock clock;
    LinuxBundle bundle;
    PropertyListCodec propertyLists;
    LinuxPreferences preferences;
    LinuxFileSystem files;
    QtMainQueue queue;
    LinuxMessagePorts ports{runtimeDirectory(), queue, log};
    LinuxTelephonyService telephony{runtimeDirectory(), ports, queue, log};
};

LinuxDevice::LinuxDevice(const std::string& program, Output output)
    : _adapters(std::make_unique<Adapters>(program, output))
{}

LinuxDevice::~LinuxDevice() = default;

MonitorRoles LinuxDevice::monitorRoles()
{
    auto& made = *_adapters;
    return {
        {made.log, *made.console, made.clock, made.bundle, made.propertyLists}, made.queue, made.ports, made.telephony};
}

ApplicationRoles LinuxDevice::applicationRoles(Toolkit& toolkit)
{
    return {monitorRoles(), _adapters->preferences, _adapters->files, toolkit};
}

void LinuxDevice::dropQueued()
{
    _adapters->queue.clear();
}

} // namespace kestrum
