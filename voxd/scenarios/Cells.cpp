#include "voxd/scenarios/Cells.h"

namespace kestrum {
namespace {

constexpr LteLayer kLteLayers[] = {
    {{1815, 12}, 3, 1300, 19300, 100, 5},
    {{806, 7}, 20, 6300, 24300, 50, 4},
};

// Area codes of one network are consecutive; those of the other network are far away.
int areaCode(const World& world, std::size_t site, int first)
{
    const Site& at = world.sites()[site];
    return first + (at.abroad ? 0x1000 : 0) + at.area;
}

} // namespace

GsmCell gsmCell(const World& world, std::size_t site)
{
    const int number = static_cast<int>(site);
    // The network colour code distinguishes the networks at the border (3GPP TS 23.003).
    const int networkColour = world.sites()[site].abroad ? 5 : 2;
    return {3 * number + 1, 8 * networkColour + number % 8, 0x2A00 + 16 * number + 1, areaCode(world, site, 0x1101),
            1 + world.sites()[site].area};
}

UmtsCell umtsCell(const World& world, std::size_t site)
{
    constexpr int kDuplex = 950; // band I: 190 MHz in steps of 200 kHz
    const int number = static_cast<int>(site), uarfcn = 10687;
    const int controller = world.sites()[site].abroad ? 0x321 : 0x120;
    return {uarfcn,
            uarfcn - kDuplex,
            8 * number + 5,
            (controller << 16) + 0x0B00 + number,
            areaCode(world, site, 0x1101),
            1 + world.sites()[site].area,
            areaCode(world, site, 0x0301)};
}

TddCell tddCell(const World& world, std::size_t site)
{
    const int number = static_cast<int>(site);
    const Site& at = world.sites()[site];
    return {at.abroad ? 10088 : 10063, 3 * number + 2, ((at.abroad ? 0x4B2 : 0x2A1) << 16) + 0x0C00 + number,
            areaCode(world, site, 0x1301), 17 + 4 * at.abroad + at.area};
}

std::span<const LteLayer> lteLayers()
{
    return kLteLayers;
}

LteCell lteCell(const World& world, std::size_t layer, std::size_t site)
{
    const int number = static_cast<int>(site), cell = static_cast<int>(layer);
    const int station = (world.sites()[site].abroad ? 0x3C00 : 0x1A00) + number;
    return {3 * number + 120 * cell + 7, (station << 8) + cell + 1, areaCode(world, site, 0x1501)};
}

CdmaCell cdmaCell(const World& world, std::size_t site)
{
    constexpr int kPilotIncrement = 4;
    const int number = static_cast<int>(site);
    const Site& at = world.sites()[site];
    return {kPilotIncrement * (3 * number + 1), at.abroad ? 16422 : 16390, at.abroad ? 7 : 3, 20 + at.area,
            0x0600 + 8 * number + 1};
}

} // namespace kestrum
