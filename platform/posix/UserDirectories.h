#pragma once

#include <string>

namespace kestrum {

/// A base directory of the user by the XDG rules: the value of `variable` where it is an absolute path, else `fallback`
/// below the home directory: userDirectory("XDG_STATE_HOME", ".local/state"). Without HOME the home directory is that of
/// the user database; a user without one gets a path that does not exist, never the root directory.
std::string userDirectory(const char* variable, const std::string& fallback);

} // namespace kestrum
