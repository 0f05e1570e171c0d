#pragma once

#include <cstdint>
#include <optional>
#include <string_view>
#include <vector>

namespace kestrum {

/// A radio carrier: what a channel number stands for in one band.
struct Carrier {
    std::string_view band;          ///< as the standard writes it: "20", "VIII", "P-GSM 900", "a"
    std::optional<double> downlink; ///< MHz; nothing for a band without a downlink
    std::optional<double> uplink;   ///< MHz; nothing for a band without an uplink; the downlink's in a TDD band

    friend bool operator==(const Carrier&, const Carrier&) = default;
};

// Channel numbers to carriers. One carrier in general; several when bands share the number; none when no band has it.
// The other direction is a channel pair at the band's usual distance.

/// E-UTRA (EARFCN), 3GPP TS 36.101, tables 5.5-1 and 5.7.3-1, bands of releases 8 to 17: the number of a downlink, or
/// of an uplink.
std::vector<Carrier> carriersOfEarfcn(std::int64_t number);

struct FrequencyRange {
    double low, high; ///< MHz

    friend bool operator==(const FrequencyRange&, const FrequencyRange&) = default;
};
/// The frequencies of an E-UTRA band, from the same tables; a TDD band has them twice, a downlink band has no uplink.
struct BandRange {
    std::optional<FrequencyRange> downlink, uplink;
};
std::optional<BandRange> lteBand(std::int64_t number);

/// NR (NR-ARFCN), the global raster of 3GPP TS 38.104, table 5.4.2.1-1: MHz. Bands overlap, so it tells no band.
std::optional<double> frequencyOfNrArfcn(std::int64_t number);

/// UTRA FDD (UARFCN), 3GPP TS 25.101, tables 5.1 and 5.1A. Downlinks and uplinks share numbers, so there are two
/// functions.
std::vector<Carrier> carriersOfDownlinkUarfcn(std::int64_t number);
std::vector<Carrier> carriersOfUplinkUarfcn(std::int64_t number);

/// UTRA TDD (UARFCN), 3GPP TS 25.102, 5.2 to 5.4.
std::vector<Carrier> carriersOfTddUarfcn(std::int64_t number);

/// GSM (ARFCN), 3GPP TS 45.005, clause 2. 512 to 810 are channels of DCS 1800 and of PCS 1900: the cell says which.
std::vector<Carrier> carriersOfArfcn(std::int64_t number);

/// CDMA (channel number of a band class), 3GPP2 C.S0057, band classes 0 to 12.
std::optional<Carrier> carrierOfCdmaChannel(std::int64_t bandClass, std::int64_t number);

} // namespace kestrum
