#pragma once

#include "doubles/MemoryFileSystem.h"
#include "doubles/MonitorDoubles.h"
#include "doubles/RecordingPreferences.h"
#include "doubles/RecordingToolkit.h"

namespace kestrum {

/// All that the application needs, doubled.
struct ApplicationDoubles : MonitorDoubles {
    RecordingPreferences preferences;
    MemoryFileSystem files;
    RecordingToolkit toolkit;

    ApplicationRoles applicationRoles{monitorRoles, preferences, files, toolkit};

    // What is queued may hold the application, and the application the toolkit's screens.
    ~ApplicationDoubles() { queue.drop(); }
};

} // namespace kestrum
