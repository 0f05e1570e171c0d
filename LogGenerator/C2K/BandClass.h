#pragma once

#include <cstdint>
#include <string>

namespace kestrum {

/// The name of a CDMA band class (3GPP2 C.S0057). Kept: testers know these texts, also "900 MHzband" without its blank.
std::string bandClassName(std::uint32_t bandClass);

} // namespace kestrum
