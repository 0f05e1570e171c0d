#pragma once

#include "support/Value.h"

namespace kestrum {

/// All that a run knows, under the keys of StateKey. The model owns it; it outlives every generator.
using State = Dictionary;

/// The keys of the state. An entry of the history has a display, its state and its extra information under the same
/// keys, and a date and a description.
namespace StateKey {

inline constexpr char kDisplay[] = "Display";           ///< what the panes show
inline constexpr char kDisplayState[] = "DisplayState"; ///< what it was made of since the last refresh
inline constexpr char kExtraInfo[] = "ExtraInfo";
inline constexpr char kHistory[] = "History";   ///< the newest displays
inline constexpr char kTemplate[] = "Template"; ///< of the technologies that have one
inline constexpr char kLookup[] = "Lookup";     ///< CDMA: where each identifier is shown
inline constexpr char kDate[] = "Date";
inline constexpr char kDescription[] = "Description";

} // namespace StateKey

} // namespace kestrum
