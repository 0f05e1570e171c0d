#pragma once

#include "platform/Roles.h"
#include "platform/Stored.h"

#include <functional>
#include <string>
#include <string_view>

namespace kestrum {

/// Calls `store` with a path in the directory of diagnostic logs, without an ending: <name>-<seconds since 1970>. When
/// another display has taken the name, with that of the next second, up to a minute.
Stored storeInNewFile(std::string_view name, ApplicationRoles& roles,
                      const std::function<Stored(const std::string& path)>& store);

/// Tells the user and the log of a file that could not be written. `what`: "snapshot".
void tellOfFailedFile(std::string_view what, std::string_view path, ApplicationRoles& roles);

} // namespace kestrum
