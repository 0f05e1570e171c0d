#include "LogGenerator/ZPH_GSM/ActiveSet.h"

#include "LogGenerator/ZPH_GSM/SearcherCells.h"

namespace kestrum {
namespace {

// Offsets in a cell.
constexpr Field kScramblingCode = u16(7).bits(0, 12);
constexpr Field kSetMembership = u16(7).bits(13, 15);
constexpr std::uint32_t kActive = 0;

// In a measurement: linear Ec/Io, full scale 2^19.
constexpr Field kEnergies[] = {u32(32), u32(36), u32(40)};

/// The first value that is not zero; zero when all are.
std::uint32_t energyOf(Record measurement)
{
    for (const Field field : kEnergies)
        if (const auto energy = measurement.read(field); energy.value_or(0) != 0)
            return *energy;
    return 0;
}

/// Received power in whole dBm. The raw AGC value plus 512 is the level above -106 dBm in 0.1 dB.
int receivedPower(std::int16_t agc)
{
    return (agc + 512) / 10 - 106; // truncated toward zero
}

void showCell(Record cell, Record measurement, int power, Dictionary& row)
{
    const int energyPerChip = Base::lookUpECNO(energyOf(measurement));
    row.set("Scrambling Code", Reading(decimalSigned32, cell.read(kScramblingCode).value_or(0)));
    // Kept: shown in "dB" although it is a level in dBm.
    row.set("RSCP", Reading(inWholeDb<signed32>, static_cast<std::uint32_t>(power + energyPerChip)));
    row.set("Energy Per Chip", Reading(inWholeDb<signed32>, static_cast<std::uint32_t>(energyPerChip)));
}

constexpr Layout kLayouts[] = {
    {.code = searcher::kCode, .minimumLength = searcher::kMinimumLength},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Active Set",
    .layouts = kLayouts,
    .entryLine = "ActiveSet",
};

} // namespace

ActiveSet::ActiveSet(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void ActiveSet::decode(Record data, const Layout&)
{
    const int power = receivedPower(static_cast<std::int16_t>(data.read(searcher::kReceiveAgc).value_or(0)));
    const std::size_t count = data.read(searcher::kCount).value_or(0);
    const Elements measurements{searcher::kCells.first + searcher::kCells.stride * count, searcher::kMeasurementSize};

    replaceArray(sectionRef, [&](Array& list) {
        for (std::size_t i = 0; i < count; ++i) {
            const auto cell = elementOf(data, searcher::kCells, i);
            const auto measurement = elementOf(data, measurements, i);
            if (!cell || !measurement)
                break;
            if (cell->read(kSetMembership) == kActive)
                showCell(*cell, *measurement, power, list.appendRow());
        }
    });
}

} // namespace kestrum
