#include "insight/keys/Channels.h"

#include <algorithm>
#include <string>

namespace kestrum {
namespace {

// Frequencies in kHz: channels lie on multiples of 100 kHz.
struct Direction {
    int lowest; ///< the frequency of the first number
    int first, last;

    bool has(std::int64_t number) const { return first <= number && number <= last; }
    bool isThere() const { return first <= last; }
    double at(std::int64_t number) const { return (lowest + 100.0 * static_cast<double>(number - first)) / 1000; }
};
constexpr Direction kNoUplink{0, 0, -1};

struct Band {
    std::string_view name;
    Direction downlink, uplink;
};

// clang-format off
constexpr Band kPaired[] = {
    {"1",  {2110000,     0,   599}, {1920000,  18000,  18599}},
    {"2",  {1930000,   600,  1199}, {1850000,  18600,  19199}},
    {"3",  {1805000,  1200,  1949}, {1710000,  19200,  19949}},
    {"4",  {2110000,  1950,  2399}, {1710000,  19950,  20399}},
    {"5",  { 869000,  2400,  2649}, { 824000,  20400,  20649}},
    {"6",  { 875000,  2650,  2749}, { 830000,  20650,  20749}},
    {"7",  {2620000,  2750,  3449}, {2500000,  20750,  21449}},
    {"8",  { 925000,  3450,  3799}, { 880000,  21450,  21799}},
    {"9",  {1844900,  3800,  4149}, {1749900,  21800,  22149}},
    {"10", {2110000,  4150,  4749}, {1710000,  22150,  22749}},
    {"11", {1475900,  4750,  4949}, {1427900,  22750,  22949}},
    {"12", { 729000,  5010,  5179}, { 699000,  23010,  23179}},
    {"13", { 746000,  5180,  5279}, { 777000,  23180,  23279}},
    {"14", { 758000,  5280,  5379}, { 788000,  23280,  23379}},
    {"17", { 734000,  5730,  5849}, { 704000,  23730,  23849}},
    {"18", { 860000,  5850,  5999}, { 815000,  23850,  23999}},
    {"19", { 875000,  6000,  6149}, { 830000,  24000,  24149}},
    {"20", { 791000,  6150,  6449}, { 832000,  24150,  24449}},
    {"21", {1495900,  6450,  6599}, {1447900,  24450,  24599}},
    {"22", {3510000,  6600,  7399}, {3410000,  24600,  25399}},
    {"23", {2180000,  7500,  7699}, {2000000,  25500,  25699}},
    {"24", {1525000,  7700,  8039}, {1626500,  25700,  26039}},
    {"25", {1930000,  8040,  8689}, {1850000,  26040,  26689}},
    {"26", { 859000,  8690,  9039}, { 814000,  26690,  27039}},
    {"27", { 852000,  9040,  9209}, { 807000,  27040,  27209}},
    {"28", { 758000,  9210,  9659}, { 703000,  27210,  27659}},
    {"29", { 717000,  9660,  9769}, kNoUplink},
    {"30", {2350000,  9770,  9869}, {2305000,  27660,  27759}},
    {"31", { 462500,  9870,  9919}, { 452500,  27760,  27809}},
    {"32", {1452000,  9920, 10359}, kNoUplink},
    {"65", {2110000, 65536, 66435}, {1920000, 131072, 131971}},
    {"66", {2110000, 66436, 67335}, {1710000, 131972, 132671}}, // the downlink's upper 20 MHz have no pair
    {"67", { 738000, 67336, 67535}, kNoUplink},
    {"68", { 753000, 67536, 67835}, { 698000, 132672, 132971}},
    {"69", {2570000, 67836, 68335}, kNoUplink},
    {"70", {1995000, 68336, 68585}, {1695000, 132972, 133121}}, // the downlink's upper 10 MHz have no pair
    {"71", { 617000, 68586, 68935}, { 663000, 133122, 133471}},
    {"72", { 461000, 68936, 68985}, { 451000, 133472, 133521}},
    {"73", { 460000, 68986, 69035}, { 450000, 133522, 133571}},
    {"74", {1475000, 69036, 69465}, {1427000, 133572, 134001}},
    {"75", {1432000, 69466, 70315}, kNoUplink},
    {"76", {1427000, 70316, 70365}, kNoUplink},
    {"85", { 728000, 70366, 70545}, { 698000, 134002, 134181}},
    {"87", { 420000, 70546, 70595}, { 410000, 134182, 134231}},
    {"88", { 422000, 70596, 70645}, { 412000, 134232, 134281}},
    {"103", {757000, 70646, 70655}, { 787000, 134282, 134291}},
};

struct UnpairedBand {
    std::string_view name;
    Direction both;
};
constexpr UnpairedBand kUnpaired[] = {
    {"33", {1900000, 36000, 36199}},
    {"34", {2010000, 36200, 36349}},
    {"35", {1850000, 36350, 36949}},
    {"36", {1930000, 36950, 37549}},
    {"37", {1910000, 37550, 37749}},
    {"38", {2570000, 37750, 38249}},
    {"39", {1880000, 38250, 38649}},
    {"40", {2300000, 38650, 39649}},
    {"41", {2496000, 39650, 41589}},
    {"42", {3400000, 41590, 43589}},
    {"43", {3600000, 43590, 45589}},
    {"44", { 703000, 45590, 46589}},
    {"45", {1447000, 46590, 46789}},
    {"46", {5150000, 46790, 54539}},
    {"47", {5855000, 54540, 55239}},
    {"48", {3550000, 55240, 56739}},
    {"49", {3550000, 56740, 58239}},
    {"50", {1432000, 58240, 59089}},
    {"51", {1427000, 59090, 59139}},
    {"52", {3300000, 59140, 60139}},
    {"53", {2483500, 60140, 60254}},
};
// clang-format on

/// The frequency of the number at the same place in the band's other direction.
std::optional<double> paired(const Direction& from, std::int64_t number, const Direction& with)
{
    const std::int64_t other = number - from.first + with.first;
    return with.has(other) ? std::optional(with.at(other)) : std::nullopt;
}

std::optional<FrequencyRange> rangeOf(const Direction& direction)
{
    if (!direction.isThere())
        return std::nullopt;
    return FrequencyRange{direction.at(direction.first), direction.at(direction.last + 1)};
}

} // namespace

std::optional<BandRange> lteBand(std::int64_t number)
{
    const auto name = std::to_string(number);
    if (const auto* band = std::ranges::find(kPaired, name, &Band::name); band != std::end(kPaired))
        return BandRange{rangeOf(band->downlink), rangeOf(band->uplink)};
    if (const auto* band = std::ranges::find(kUnpaired, name, &UnpairedBand::name); band != std::end(kUnpaired))
        return BandRange{rangeOf(band->both), rangeOf(band->both)};
    return std::nullopt;
}

std::vector<Carrier> carriersOfEarfcn(std::int64_t number)
{
    for (const auto& [name, downlink, uplink] : kPaired) {
        if (downlink.has(number))
            return {{name, downlink.at(number), paired(downlink, number, uplink)}};
        if (uplink.has(number))
            return {{name, paired(uplink, number, downlink), uplink.at(number)}};
    }
    for (const auto& [name, both] : kUnpaired)
        if (both.has(number))
            return {{name, both.at(number), both.at(number)}};
    return {};
}

} // namespace kestrum
