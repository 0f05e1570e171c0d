#include "insight/keys/Channels.h"

#include <algorithm>
#include <cmath>
#include <span>

namespace kestrum {
namespace {

/// Numbers of one direction of a band: F = number / 5 + offset, in MHz.
struct General {
    double offset;
    int first, last;
};
/// Numbers of carriers that lie 100 kHz off the raster of 200 kHz.
struct Additional {
    double offset;
    std::span<const int> numbers;
};
struct Direction {
    General general;
    Additional additional;

    std::optional<double> at(std::int64_t number) const
    {
        if (general.first <= number && number <= general.last)
            return static_cast<double>(number) / 5 + general.offset;
        if (std::ranges::find(additional.numbers, number) != additional.numbers.end())
            return static_cast<double>(number) / 5 + additional.offset;
        return std::nullopt;
    }
};

struct Band {
    std::string_view name;
    double distance; ///< from the uplink to the downlink, MHz
    Direction uplink, downlink;
    bool hasUplink = true;
};

// The additional numbers, by band and direction.
// clang-format off
constexpr int kUp2[]    = {12, 37, 62, 87, 112, 137, 162, 187, 212, 237, 262, 287};
constexpr int kDown2[]  = {412, 437, 462, 487, 512, 537, 562, 587, 612, 637, 662, 687};
constexpr int kUp4[]    = {1662, 1687, 1712, 1737, 1762, 1787, 1812, 1837, 1862};
constexpr int kDown4[]  = {1887, 1912, 1937, 1962, 1987, 2012, 2037, 2062, 2087};
constexpr int kUp5[]    = {782, 787, 807, 812, 837, 862};
constexpr int kDown5[]  = {1007, 1012, 1032, 1037, 1062, 1087};
constexpr int kUp6[]    = {812, 837};
constexpr int kDown6[]  = {1037, 1062};
constexpr int kUp7[]    = {2362, 2387, 2412, 2437, 2462, 2487, 2512, 2537, 2562, 2587, 2612, 2637, 2662, 2687};
constexpr int kDown7[]  = {2587, 2612, 2637, 2662, 2687, 2712, 2737, 2762, 2787, 2812, 2837, 2862, 2887, 2912};
constexpr int kUp10[]   = {3187, 3212, 3237, 3262, 3287, 3312, 3337, 3362, 3387, 3412, 3437, 3462};
constexpr int kDown10[] = {3412, 3437, 3462, 3487, 3512, 3537, 3562, 3587, 3612, 3637, 3662, 3687};
constexpr int kUp12[]   = {3707, 3732, 3737, 3762, 3767};
constexpr int kDown12[] = {3932, 3957, 3962, 3987, 3992};
constexpr int kUp13[]   = {3842, 3867};
constexpr int kDown13[] = {4067, 4092};
constexpr int kUp14[]   = {3942, 3967};
constexpr int kDown14[] = {4167, 4192};
constexpr int kUp19[]   = {387, 412, 437};
constexpr int kDown19[] = {787, 812, 837};
constexpr int kUp25[]   = {6067, 6092, 6117, 6142, 6167, 6192, 6217, 6242, 6267, 6292, 6317, 6342, 6367};
constexpr int kDown25[] = {6292, 6317, 6342, 6367, 6392, 6417, 6442, 6467, 6492, 6517, 6542, 6567, 6592};
constexpr int kUp26[]   = {5712, 5737, 5762, 5767, 5787, 5792, 5812, 5817, 5837, 5842, 5862};
constexpr int kDown26[] = {5937, 5962, 5987, 5992, 6012, 6017, 6037, 6042, 6062, 6067, 6087};

constexpr Band kBands[] = {
    {"I",     190, {{   0, 9612, 9888}, {}},              {{   0, 10562, 10838}, {}}},
    {"II",     80, {{   0, 9262, 9538}, {1850.1, kUp2}},  {{   0,  9662,  9938}, {1850.1, kDown2}}},
    {"III",    95, {{1525,  937, 1288}, {}},              {{1575,  1162,  1513}, {}}},
    {"IV",    400, {{1450, 1312, 1513}, {1380.1, kUp4}},  {{1805,  1537,  1738}, {1735.1, kDown4}}},
    {"V",      45, {{   0, 4132, 4233}, {670.1, kUp5}},   {{   0,  4357,  4458}, {670.1, kDown5}}},
    {"VI",     45, {{   0, 4162, 4188}, {670.1, kUp6}},   {{   0,  4387,  4413}, {670.1, kDown6}}},
    {"VII",   120, {{2100, 2012, 2338}, {2030.1, kUp7}},  {{2175,  2237,  2563}, {2105.1, kDown7}}},
    {"VIII",   45, {{ 340, 2712, 2863}, {}},              {{ 340,  2937,  3088}, {}}},
    {"IX",     95, {{   0, 8762, 8912}, {}},              {{   0,  9237,  9387}, {}}},
    {"X",     400, {{1135, 2887, 3163}, {1075.1, kUp10}}, {{1490,  3112,  3388}, {1430.1, kDown10}}},
    {"XI",     48, {{ 733, 3487, 3562}, {}},              {{ 736,  3712,  3787}, {}}},
    {"XII",    30, {{ -22, 3617, 3678}, {-39.9, kUp12}},  {{ -37,  3842,  3903}, {-54.9, kDown12}}},
    {"XIII",  -31, {{  21, 3792, 3818}, {11.1, kUp13}},   {{ -55,  4017,  4043}, {-64.9, kDown13}}},
    {"XIV",   -30, {{  12, 3892, 3918}, {2.1, kUp14}},    {{ -63,  4117,  4143}, {-72.9, kDown14}}},
    {"XIX",    45, {{ 770,  312,  363}, {755.1, kUp19}},  {{ 735,   712,   763}, {720.1, kDown19}}},
    {"XX",    -41, {{ -23, 4287, 4413}, {}},              {{-109,  4512,  4638}, {}}},
    {"XXI",    48, {{1358,  462,  512}, {}},              {{1326,   862,   912}, {}}},
    {"XXII",  100, {{2525, 4437, 4813}, {}},              {{2580,  4662,  5038}, {}}},
    {"XXV",    80, {{ 875, 4887, 5188}, {639.1, kUp25}},  {{ 910,  5112,  5413}, {674.1, kDown25}}},
    {"XXVI",   45, {{-291, 5537, 5688}, {-325.9, kUp26}}, {{-291,  5762,  5913}, {-325.9, kDown26}}},
    {"XXXII",   0, {{   0,    0,   -1}, {}},              {{ 131,  6617,  6813}, {}}, false},
};

// Low and high edge, MHz. All of them have F = number / 5.
struct TddBand {
    std::string_view name;
    int low, high;
};
constexpr TddBand kTddBands[] = {
    {"a", 1900, 1920}, {"a", 2010, 2025}, {"b", 1850, 1910}, {"b", 1930, 1990},
    {"c", 1910, 1930}, {"d", 2570, 2620}, {"e", 2300, 2400}, {"f", 1880, 1920},
};
// clang-format on

/// In steps of 100 kHz, so that sums of the table's numbers are equal to the frequencies that they stand for.
double rounded(double megahertz)
{
    return std::round(megahertz * 10) / 10;
}

} // namespace

std::vector<Carrier> carriersOfDownlinkUarfcn(std::int64_t number)
{
    std::vector<Carrier> found;
    for (const auto& band : kBands)
        if (const auto frequency = band.downlink.at(number))
            found.push_back({band.name, rounded(*frequency),
                             band.hasUplink ? std::optional(rounded(*frequency - band.distance)) : std::nullopt});
    return found;
}

std::vector<Carrier> carriersOfUplinkUarfcn(std::int64_t number)
{
    std::vector<Carrier> found;
    for (const auto& band : kBands)
        if (const auto frequency = band.uplink.at(number))
            found.push_back({band.name, rounded(*frequency + band.distance), rounded(*frequency)});
    return found;
}

std::vector<Carrier> carriersOfTddUarfcn(std::int64_t number)
{
    constexpr std::int64_t kPerMegahertz = 5;
    std::vector<Carrier> found;
    for (const auto& band : kTddBands)
        if (kPerMegahertz * band.low < number && number < kPerMegahertz * band.high)
            found.push_back({band.name, static_cast<double>(number) / 5, static_cast<double>(number) / 5});
    return found;
}

} // namespace kestrum
