#include "LogGenerator/C2K/Decoders.h"
#include "LogGenerator/C2K/Quantities.h"
#include "platform/SystemLog.h"

#include <cmath>

namespace kestrum {
namespace {

constexpr std::uint32_t kUnusedFinger = 0xFFFF, kNone = 0x10000; // PNs have 16 bits

/// The layout of a record's list of pilots.
struct PilotList {
    Field count;
    std::size_t first, size;
    Field pn, energy;      ///< offsets from the pilot's first byte; energies in units of 1/512
    std::uint32_t leftOut; ///< the PN that marks an entry as unused
};

// clang-format off
constexpr PilotList kActiveSet{u8(15), 25, 12, u16(0), u16(2), kNone};
constexpr PilotList kFingers  {u8(22), 23, 14, u16(0), u16(6), kUnusedFinger};
// clang-format on

unsigned lengthOf(Record record)
{
    return static_cast<unsigned>(record.size());
}

/// Publishes {"_sorted", "0;PN": strength, ...}. The index comes first, so that the list keeps the record's order; an
/// omitted pilot leaves a gap in the index.
void listStrengths(Record record, const PilotList& list, std::uint32_t count, Dictionary& shown)
{
    shown.setText(kSortedKey, kSortedKey);
    for (std::uint32_t i = 0; i < count; ++i) {
        const auto pilot = record.slice(list.first + list.size * i, list.size);
        if (!pilot)
            break;
        const auto pn = pilot->read(list.pn).value_or(0);
        if (pn == list.leftOut)
            continue;
        const double ratio = pilot->read(list.energy).value_or(0) / 512.0;
        shown.set(formatted("%d;%d", static_cast<std::int32_t>(i), static_cast<std::int32_t>(pn)),
                  Reading::computed(kPilotStrength, 10.0 * std::log10(ratio)));
    }
}

void publishPilots(C2KContext& context, std::string_view identifier, Record record, const PilotList& list,
                   std::uint32_t count)
{
    context.publish(identifier, [&](Value& shown) {
        Dictionary& pilots = shown.becomeDictionary();
        listStrengths(record, list, count, pilots);
        if (pilots.size() == 1)
            shown = "(none)";
    });
}

} // namespace

void decodeActiveSetPilots(Record record, C2KContext& context)
{
    if (record.size() < kActiveSet.first) {
        context.rejectLength(formatted("Log code 0x12b6 is %u bytes long but must be at least %lu bytes.",
                                       lengthOf(record), kActiveSet.first));
        return;
    }
    const auto count = record.read(kActiveSet.count).value_or(0);
    if (record.size() < kActiveSet.first + kActiveSet.size * count) {
        context.rejectLength(formatted("Log code 0x12b6 is %u bytes long, but has %d substructs.", lengthOf(record),
                                       static_cast<std::int32_t>(count)));
        return;
    }
    publishPilots(context, "kActiveSetPilots", record, kActiveSet, count);
}

void decodeFingers(Record record, C2KContext& context)
{
    if (record.size() < kFingers.first) {
        context.rejectLength(formatted("Log code 0x108a is %u bytes long but must be at least %lu bytes.",
                                       lengthOf(record), kFingers.first));
        return;
    }
    const auto count = record.read(kFingers.count).value_or(0);
    if (record.size() != kFingers.first + kFingers.size * count) {
        // Kept: "size" is that of the fixed part, not of a finger.
        context.rejectLength(formatted("Log code 0x108a has bad length of %u bytes, but has %d substructs (size=%lu).",
                                       lengthOf(record), static_cast<std::int32_t>(count), kFingers.first));
        return;
    }
    publishPilots(context, "kFingerC2I", record, kFingers, count);
}

} // namespace kestrum
