#pragma once

#include "support/Problem.h"

#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

/// Where the sockets of this user's programs stand: $KESTRUM_RUNTIME_DIR, else $XDG_RUNTIME_DIR/kestrum, else
/// /tmp/kestrum-<uid>.
std::string runtimeDirectory();

/// Creates the directory with mode 0700 where there is none. It is a problem when the path is relative or leaves no
/// room for a display's socket in it, and when the directory cannot be made, belongs to another user, is open to
/// others, or is no directory. The mode of a directory that exists is never changed.
std::optional<Problem> secureRuntimeDirectory(const std::string& directory);

/// Whether a name may stand for a port: letters, digits, ".", "-" and "_", not beginning with ".".
bool isPortName(std::string_view name);

} // namespace kestrum
