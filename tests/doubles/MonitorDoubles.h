#pragma once

#include "doubles/CrankedQueue.h"
#include "doubles/DecodingDoubles.h"
#include "doubles/MemoryPorts.h"

namespace kestrum {

/// Doubles of all roles that the monitor model needs. The clock moves with the queue.
struct MonitorDoubles : DecodingDoubles {
    CrankedQueue queue{clock};
    MemoryPorts ports{queue};
    MemoryTelephony telephony{queue, ports};

    MonitorRoles monitorRoles{roles, queue, ports, telephony};

    // Before the ports and the log are destroyed, in the same order as in the program.
    ~MonitorDoubles() { queue.drop(); }
};

} // namespace kestrum
