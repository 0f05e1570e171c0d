#pragma once

#include <string>

namespace kestrum {

/// An XDG base directory, as freedesktop.org defines it: the value of `variable` when it is an absolute path, else
/// `fallback` below the home directory: userDirectory("XDG_STATE_HOME", ".local/state"). Without HOME the user database
/// gives the home directory; without an entry there the path does not exist (it is never the root directory).
std::string userDirectory(const char* variable, const std::string& fallback);

} // namespace kestrum
