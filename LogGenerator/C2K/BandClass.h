#pragma once

#include <cstdint>
#include <string>

namespace kestrum {

/// The name of a CDMA band class (3GPP2 C.S0057), worded as testers know it: the blank missing in "900 MHzband" too.
std::string bandClassName(std::uint32_t bandClass);

} // namespace kestrum
