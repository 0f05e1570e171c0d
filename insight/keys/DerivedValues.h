#pragma once

#include "support/Value.h"

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// A value that follows from a reading by a public standard.
struct DerivedValue {
    std::string name; ///< "Downlink"
    std::string text; ///< "806.0 MHz"

    friend bool operator==(const DerivedValue&, const DerivedValue&) = default;
};
using DerivedValues = std::vector<DerivedValue>;

/// A value of the display, and the dictionary that holds it (null when it is not known).
struct Given {
    const Value& value;
    const Dictionary* beside;

    /// The value as a whole number. From a text: "60", "0x2a01", or the number in brackets at its end ("... [5]").
    std::optional<std::int64_t> whole() const;
    /// The same for another key of the dictionary.
    std::optional<std::int64_t> wholeBeside(std::string_view key) const;
};

/// A key as a pane shows it: "3;Neighbor" is "Neighbor".
std::string_view shownName(std::string_view key);

/// Nothing follows from a number out of range, or from a value without a number.
using Derive = DerivedValues(const Given& given);

// Channel numbers: band and frequencies.
Derive fromEarfcn, fromNrArfcn, fromDownlinkUarfcn, fromUplinkUarfcn, fromTddUarfcn, fromArfcn;
/// A UARFCN of FDD or TDD: both, where both have the number.
Derive fromAnyUarfcn;
// CDMA channels need the band class beside them: under "Band Class", "Rx0 Band Class", "Rx1 Band Class" or "Band".
Derive fromEvdoChannel, fromRx0Channel, fromRx1Channel, fromCandidateChannel;

// Bands and bandwidths of LTE: frequencies, number of resource blocks.
Derive fromLteBand, fromLteBandwidth;

// Identities: their parts.
Derive fromLteCellIdentity, fromPhysicalCellId, fromUtranCellIdentity, fromScramblingCode, fromCellParameter, fromBsic,
    fromPilot;
/// Of GSM (16 bits) or of UMTS (more).
Derive fromCellIdentity;
/// Hexadecimal, as maps and networks write location areas, tracking areas and GSM cells.
Derive inHexadecimal;

// Indexes of a standard: the range that they stand for.
Derive fromRxLev, fromRxQual, fromTimingAdvance, fromHoppingSequence;

/// The block error rate of a row with "CRC Received" and "CRC Received in Error".
Derive fromBlockErrors;

} // namespace kestrum
