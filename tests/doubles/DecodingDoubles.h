#pragma once

#include "doubles/MemoryBundle.h"
#include "doubles/MemoryPropertyLists.h"
#include "doubles/RecordingConsole.h"
#include "doubles/RecordingLog.h"
#include "doubles/VirtualClock.h"
#include "platform/Roles.h"

namespace kestrum {

/// Doubles of all roles that decoding needs.
struct DecodingDoubles {
    RecordingLog log;
    RecordingConsole console;
    VirtualClock clock;
    MemoryBundle bundle;
    MemoryPropertyLists propertyLists;

    DecodingRoles roles{log, console, clock, bundle, propertyLists};
};

} // namespace kestrum
