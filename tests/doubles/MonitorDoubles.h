#pragma once

#include "doubles/CrankedQueue.h"
#include "doubles/DecodingDoubles.h"
#include "doubles/MemoryPorts.h"

namespace kestrum {

/// All that the monitor model needs, doubled. The clock moves with the queue.
struct MonitorDoubles : DecodingDoubles {
    CrankedQueue queue{clock};
    MemoryPorts ports{queue};
    MemoryTelephony telephony{queue, ports};

    MonitorRoles monitorRoles{roles, queue, ports, telephony};

    // Before the ports and the log go, as the program's end does it.
    ~MonitorDoubles() { queue.drop(); }
};

} // namespace kestrum
