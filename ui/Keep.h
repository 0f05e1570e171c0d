#pragma once

#include "platform/Roles.h"

namespace kestrum {

class History;
class SharedApplication;

/// Writes the messages of the last 15 minutes as a channel capture, and all events as CSV beside it, into the directory
/// of diagnostic logs: KestrumKept-<seconds since 1970>.kcap and .csv. Says where they are, or what failed.
void keepHistory(const History& history, ApplicationRoles& roles, SharedApplication& application);

} // namespace kestrum
