#pragma once

#include "doubles/MemoryFileSystem.h"
#include "doubles/MonitorDoubles.h"
#include "doubles/RecordingPreferences.h"
#include "doubles/RecordingToolkit.h"

namespace kestrum {

/// Doubles of all roles that the application needs.
struct ApplicationDoubles : MonitorDoubles {
    RecordingPreferences preferences;
    MemoryFileSystem files;
    RecordingToolkit toolkit;

    ApplicationRoles applicationRoles{monitorRoles, preferences, files, toolkit};

    // Queued tasks may hold the application, and the application holds the toolkit's screens.
    ~ApplicationDoubles() { queue.drop(); }
};

} // namespace kestrum
