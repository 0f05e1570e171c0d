#pragma once

#include "platform/ChannelMessage.h"
#include "support/Record.h"
#include "support/Value.h"
#include "voxd/scenarios/World.h"

#include <initializer_list>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

// The property lists that the telephony service adds to the modem's log.

/// The number for a quantity that could not be measured.
constexpr int kNotMeasured = 32767;

/// A cell of the cell monitor: its technology, its type, and the numbers that the modem knows.
DictionaryRef cellReport(std::string_view technology, std::string_view type,
                         std::initializer_list<Dictionary::Entry> numbers);

/// The elementary files of the SIM (3GPP TS 31.102), as text. The location files hold the phone's last registration.
/// The other networks are forbidden.
DictionaryRef simReport(const Plmn& registered, int locationArea, int routingArea);

/// The packet data contexts: always one for the phone itself, and one for the user's data.
ArrayRef pdpReport(std::string_view radioAccess, bool userData);

/// A network identity's digits: MCC, then MNC with 2 or 3 digits.
std::string plmnText(const Plmn& plmn);
/// A network identity in its three octets (3GPP TS 24.008, 10.5.1.3).
std::vector<int> plmnOctets(const Plmn& plmn);

} // namespace kestrum
