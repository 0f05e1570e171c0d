#include "insight/keys/Channels.h"

namespace kestrum {
namespace {

/// Some numbers of a band class, for which F = reverse + (number - zero) * spacing. Frequencies in units of 100 Hz.
struct Block {
    int bandClass;
    int first, last;
    int zero;
    int spacing;
    int reverse, forward; ///< link frequencies of the number `zero`
};

constexpr std::string_view kNames[] = {"0", "1", "2", "3", "4", "5", "6", "7", "8", "9", "10", "11", "12"};

// clang-format off
constexpr Block kBlocks[] = {
    { 0,    1,  799,    0, 300,  8250000,  8700000},
    { 0,  991, 1023, 1023, 300,  8250000,  8700000},
    { 0, 1024, 1323, 1024, 300,  8150400,  8600400},
    { 1,    0, 1199,    0, 500, 18500000, 19300000},
    { 2,    0, 1000,    0, 250,  8899875,  9349875},
    { 2, 1329, 2047, 1328, 250,  8719875,  9169875},
    { 3,    1,  799,    0, 125,  9150000,  8600000},
    { 3,  801, 1039,  800, 125,  8980000,  8430000},
    { 3, 1041, 1199, 1040, 125,  8870000,  8320000},
    { 3, 1201, 1600, 1200, 125,  8930000,  8380000},
    { 4,    0,  599,    0, 500, 17500000, 18400000},
    { 5,    1,  300,    1, 250,  4500000,  4600000},
    { 5,  539,  871,  512, 250,  4110000,  4210000},
    { 5, 1039, 1473, 1024, 200,  4510100,  4610100},
    { 5, 1792, 2016, 1792, 200,  4790000,  4890000},
    { 6,    0, 1199,    0, 500, 19200000, 21100000},
    { 7,    0,  359,    0, 500,  7760000,  7460000},
    { 8,    0, 1499,    0, 500, 17100000, 18050000},
    { 9,    0,  699,    0, 500,  8800000,  9250000},
    {10,    0,  719,    0, 250,  8060000,  8510000},
    {10,  720,  919,  720, 250,  8960000,  9350000},
    {11,    1,  400,    1, 250,  4500000,  4600000},
    {11,  472,  871,  472, 250,  4100000,  4200000},
    {11, 1536, 1715, 1536, 250,  4790000,  4890000},
    {12,    0,  239,    0, 250,  8700125,  9150125},
};
// clang-format on

} // namespace

std::optional<Carrier> carrierOfCdmaChannel(std::int64_t bandClass, std::int64_t number)
{
    for (const auto& block : kBlocks) {
        if (block.bandClass != bandClass || number < block.first || number > block.last)
            continue;
        const std::int64_t distance = (number - block.zero) * block.spacing;
        constexpr double kUnitsPerMegahertz = 10000;
        return Carrier{kNames[block.bandClass], static_cast<double>(block.forward + distance) / kUnitsPerMegahertz,
                       static_cast<double>(block.reverse + distance) / kUnitsPerMegahertz};
    }
    return std::nullopt;
}

} // namespace kestrum
