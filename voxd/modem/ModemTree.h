#pragma once

#include "support/Date.h"
#include "support/Value.h"
#include "voxd/modem/ModemState.h"

#include <string>

namespace kestrum {

struct ModemTreeSetting {
    bool everyModem = false; ///< one node to each modem, even if there is one only; else the first modem's groups
    bool identities = false; ///< IMSI, ICCID, equipment and device identifiers in full
    std::string wanted = {}; ///< the identifier of the modem that the user chose; empty: any
};

/// What is known of the modems, as the tree of an IFX modem: texts, arrays and dictionaries only, ready to be sent as a
/// property list. Unknown values have no row, and a value that no modem can mean (not-a-number, a level beyond
/// 1000 dBm) counts as unknown. The size has a limit, whatever the modems say.
DictionaryRef makeModemTree(const ModemStates& states, Date time, const ModemTreeSetting& setting);

} // namespace kestrum
