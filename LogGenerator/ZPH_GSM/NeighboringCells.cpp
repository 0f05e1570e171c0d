#include "LogGenerator/ZPH_GSM/NeighboringCells.h"

#include "LogGenerator/CellMonitor.h"
#include "platform/TelephonyService.h"

namespace kestrum {
namespace {

constexpr LogCode kMeasurements = 0x5137, kColourCodes = 0x51FF, kCellMonitor = 0xFF0001;

constexpr std::size_t kMeasurementsLength = 29;
constexpr Field kMeasurementCount = u8(28);
constexpr Elements kMeasured{29, 14};
constexpr Field kArfcn = u16(0);
// clang-format off
constexpr Row kMeasuredCell[] = {
    {kArfcn, "ARFCN",    decimal},
    {u8(2),  "RSSI",     decimal},
    {u32(3), "C1 Value", decimal},
};
// clang-format on
static_assert(reach(kMeasuredCell) <= kMeasured.length);

constexpr std::size_t kColourCodesLength = 15;
constexpr Field kColourCodeCount = u8(14);
constexpr Elements kColoured{15, 4};
constexpr Field kBsic = u8(2);

constexpr Quantity kColourCode{"BSIC", decimal};

std::string level(std::uint32_t raw)
{
    constexpr std::int16_t kNotMeasured = 32767;
    const auto rssi = static_cast<std::int16_t>(raw);
    return rssi == kNotMeasured ? "" : formatted("%d dBm", 2 * rssi); // doubled on purpose
}

// clang-format off
constexpr CellRow kMonitoredCell[] = {
    {kVoxCell_ARFCN, "ARFCN", "NeighboringCells: Failed to retrieve ARFCN\n"},
    {kVoxCell_RSSI,  "RSSI",  "NeighboringCells: Failed to retrieve RSSI\n", level},
};
// clang-format on

} // namespace

std::string_view NeighboringCells::getSectionName() const
{
    return "Neighboring Cells";
}

std::vector<LogCode> NeighboringCells::getLogCodeArray() const
{
    return {kMeasurements, kColourCodes, kCellMonitor};
}

void NeighboringCells::updateWithData(Record data, LogCode logCode)
{
    logEntry();
    switch (logCode) {
    case kMeasurements:
        listMeasurements(data);
        break;
    case kColourCodes:
        learnColourCodes(data);
        break;
    case kCellMonitor:
        replaceArray(sectionRef,
                     [&](Array& list) { appendNeighbors(list, data, kVoxCellTechnology_GSM, kMonitoredCell, roles); });
        break;
    default:
        reportUnknown(logCode);
    }
}

void NeighboringCells::learnColourCodes(Record data)
{
    if (!holds(data, kColourCodesLength))
        return;
    arfcnToBsic.clear();
    const std::size_t count = data.read(kColourCodeCount).value_or(0);
    for (std::size_t i = 0; i < count; ++i) {
        const auto entry = elementOf(data, kColoured, i);
        if (!entry)
            break;
        arfcnToBsic[entry->read(kArfcn).value_or(0)] = entry->read(kBsic).value_or(0);
    }
}

void NeighboringCells::listMeasurements(Record data) const
{
    if (!holds(data, kMeasurementsLength))
        return;
    const auto measured = [this](Record cell, Dictionary& row) {
        show(cell, kMeasuredCell, row);
        if (const auto known = arfcnToBsic.find(cell.read(kArfcn).value_or(0)); known != arfcnToBsic.end())
            show(kColourCode, known->second, row);
    };
    replaceArray(sectionRef, listed(data, kMeasured, data.read(kMeasurementCount).value_or(0), measured));
}

} // namespace kestrum
