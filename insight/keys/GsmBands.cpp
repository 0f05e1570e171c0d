#include "insight/keys/Channels.h"

namespace kestrum {
namespace {

// Frequencies in kHz: channels lie 200 kHz apart.
struct Band {
    std::string_view name;
    int first, last;
    int lowest; ///< uplink of the first number
    int duplex; ///< from the uplink to the downlink
};

// P-GSM, E-GSM, R-GSM and ER-GSM overlap: each number stands in the smallest band that has it.
// clang-format off
constexpr Band kBands[] = {
    {"GSM 450",    259,  293,  450600,  10000},
    {"GSM 480",    306,  340,  479000,  10000},
    {"GSM 750",    438,  511,  777200, -30000},
    {"GSM 850",    128,  251,  824200,  45000},
    {"P-GSM 900",    1,  124,  890200,  45000},
    {"E-GSM 900",    0,    0,  890000,  45000},
    {"E-GSM 900",  975, 1023,  880200,  45000},
    {"R-GSM 900",  955,  974,  876200,  45000},
    {"ER-GSM 900", 940,  954,  873200,  45000},
    {"DCS 1800",   512,  885, 1710200,  95000},
    {"PCS 1900",   512,  810, 1850200,  80000},
};
// clang-format on

} // namespace

std::vector<Carrier> carriersOfArfcn(std::int64_t number)
{
    std::vector<Carrier> found;
    for (const auto& band : kBands) {
        if (number < band.first || number > band.last)
            continue;
        const double uplink = band.lowest + 200.0 * static_cast<double>(number - band.first);
        found.push_back({band.name, (uplink + band.duplex) / 1000, uplink / 1000});
    }
    return found;
}

} // namespace kestrum
