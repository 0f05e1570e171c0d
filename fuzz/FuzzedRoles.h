#pragma once

#include "doubles/MemoryBundle.h"
#include "doubles/RecordingConsole.h"
#include "doubles/RecordingLog.h"
#include "doubles/VirtualClock.h"
#include "platform/Roles.h"
#include "platform/propertylist/PropertyListCodec.h"

namespace kestrum::fuzz {

/// The roles that a generator needs: doubles, except for the property lists.
struct FuzzedRoles {
    RecordingLog log;
    RecordingConsole console;
    VirtualClock clock;
    MemoryBundle bundle;
    PropertyListCodec propertyLists;

    DecodingRoles roles{log, console, clock, bundle, propertyLists};
};

} // namespace kestrum::fuzz
