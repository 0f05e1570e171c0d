#pragma once

#include "support/Value.h"

namespace kestrum {

/// The data of a run under the keys of StateKey. The model owns it; it outlives every generator.
using State = Dictionary;

/// The keys of the state. A history entry uses kDisplay, kDisplayState and kExtraInfo too, and kDate and kDescription.
namespace StateKey {

inline constexpr char kDisplay[] = "Display";           ///< the display that the panes show
inline constexpr char kDisplayState[] = "DisplayState"; ///< the raw messages since the last refresh
inline constexpr char kExtraInfo[] = "ExtraInfo";
inline constexpr char kHistory[] = "History";   ///< the newest five displays
inline constexpr char kTemplate[] = "Template"; ///< absent for technologies without a template
inline constexpr char kLookup[] = "Lookup";     ///< CDMA: the places of each identifier in the display
inline constexpr char kDate[] = "Date";
inline constexpr char kDescription[] = "Description";

} // namespace StateKey

} // namespace kestrum
