#pragma once

#include <string>
#include <string_view>

namespace kestrum {

/// Where the sockets of this user's programs stand: $KESTRUM_RUNTIME_DIR, else $XDG_RUNTIME_DIR/kestrum, else
/// /tmp/kestrum-<uid>.
std::string runtimeDirectory();

/// Creates the directory, for this user alone. Empty on success, else what is wrong: it cannot be made, belongs to
/// somebody else, or is no directory.
std::string secureRuntimeDirectory(const std::string& directory);

/// Whether a name may stand for a port: letters, digits, ".", "-" and "_", not beginning with ".".
bool isPortName(std::string_view name);

} // namespace kestrum
