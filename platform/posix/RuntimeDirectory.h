#pragma once

#include "support/Problem.h"

#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

/// The directory of the sockets of this user's programs: $KESTRUM_RUNTIME_DIR, else $XDG_RUNTIME_DIR/kestrum, else
/// /tmp/kestrum-<uid>.
std::string runtimeDirectory();

/// Creates the directory, with mode 0700, when it does not exist. A problem: the path is relative, or too long for a
/// display's socket in it; the directory cannot be created, belongs to another user, is open to others, or is no
/// directory. Never changes the mode of an existing directory.
std::optional<Problem> secureRuntimeDirectory(const std::string& directory);

/// Whether the name is a valid port name: letters, digits, ".", "-" and "_"; does not begin with ".".
bool isPortName(std::string_view name);

} // namespace kestrum
