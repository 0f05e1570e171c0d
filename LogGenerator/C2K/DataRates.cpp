#include "LogGenerator/C2K/Decoders.h"
#include "platform/SystemLog.h"

namespace kestrum {
namespace {

/// The keys of a link's numbers in the state, in the display and in the history.
struct Link {
    std::string_view identifier;
    std::string_view sequence, sent;                 ///< in the state: the previous record's
    std::string_view thisSequence, thisSent;         ///< in "ExtraInfo"
    std::string_view previousSequence, previousSent; ///< in "ExtraInfo"
};

// clang-format off
constexpr Link kForward{"kFLDataRate", "FLDataSeqNum",  "FLDataSent",
                                       "FLDataSeqNum1", "FLDataSent1",
                                       "FLDataSeqNum2", "FLDataSent2"};
constexpr Link kReverse{"kRLDataRate", "RLDataSeqNum",  "RLDataSent",
                                       "RLDataSeqNum1", "RLDataSent1",
                                       "RLDataSeqNum2", "RLDataSent2"};
// clang-format on

std::string rate(double kilobits)
{
    return formatted("%.2f kbps", kilobits);
}
constexpr Quantity kRate = computedQuantity<rate>("kbps");

/// Publishes the rate since the previous record, and stores this record's numbers for the next one.
void publishRate(C2KContext& context, const Link& link, std::uint32_t sequence, std::uint64_t bitsSent)
{
    State& state = context.state;
    const auto extraInfo = state.at(StateKey::kExtraInfo).dictionary();
    const auto note = [&](std::string_view key, const Value& value) {
        if (extraInfo)
            extraInfo->set(key, value);
    };
    const auto previousSequence = state.at(link.sequence).unsignedInteger();
    const auto previousSent = state.at(link.sent).unsignedInteger();
    if (previousSequence && previousSent) {
        const auto before = static_cast<std::uint32_t>(*previousSequence);
        const auto elapsed = static_cast<std::int32_t>(sequence - before);
        // Publishes nothing when the number wraps around: the difference alone would not show the wrap.
        if (sequence > before && elapsed >= 1) {
            const auto bits = static_cast<double>(static_cast<std::int64_t>(bitsSent - *previousSent));
            context.publish(link.identifier, Reading::computed(kRate, bits / (elapsed * 1024.0)));
        }
        note(link.previousSequence, before);
        note(link.previousSent, *previousSent);
    } else {
        context.publish(link.identifier, "");
    }
    state.set(link.sequence, sequence);
    state.set(link.sent, bitsSent);
    note(link.thisSequence, sequence);
    note(link.thisSent, bitsSent);
}

/// The 32-bit counter at an offset that is known only at run time.
std::uint64_t counterAt(Record record, std::size_t offset)
{
    const auto counter = record.slice(offset, 4);
    return counter ? counter->read(u32(0)).value_or(0) : 0;
}

bool isLongEnough(Record record, std::size_t minimum, std::string_view code, C2KContext& context)
{
    if (record.size() >= minimum)
        return true;
    context.rejectLength(formatted("Log code %s is %d bytes long but must be at least %ld bytes.", code,
                                   static_cast<int>(record.size()), static_cast<long>(minimum)));
    return false;
}

// Bits of a packet, by the index of its counter. The counters between the groups count no packets.
constexpr std::uint64_t kForwardBits[] = {
    128,  256,  512, 1024, 0,    128,  256, 512,  1024, 0,    128,  256, 512,  1024, 0,    128, 256,  512,  1024,
    0,    128,  256, 512,  1024, 0,    512, 1024, 2048, 0,    128,  256, 512,  1024, 0,    512, 1024, 2048, 0,
    1024, 3072, 0,   512,  1024, 2048, 0,   4096, 0,    1024, 3072, 0,   4096, 0,    5120, 0,   5120, 0};
static_assert(std::size(kForwardBits) == 56);

// Indexed by the rate.
constexpr std::uint64_t kReverseBits[] = {128, 256, 512, 768, 1024, 1536, 2048, 3072, 4096, 6144, 8192, 12288};
constexpr std::size_t kReverseGroups = 3;
constexpr std::size_t kReverseGroupSize = 576, kReverseRateSize = 24;
constexpr std::size_t kReverseCounters[] = {18, 306}; // the first of four successive counters

} // namespace

void decodeForwardLinkRate(Record record, C2KContext& context)
{
    constexpr std::size_t kMinimumLength = 241, kCounters = 17;
    static_assert(kCounters + 4 * std::size(kForwardBits) <= kMinimumLength);
    if (!isLongEnough(record, kMinimumLength, "0x1192", context))
        return;
    std::uint64_t bits = 0;
    for (std::size_t i = 0; i < std::size(kForwardBits); ++i)
        bits += kForwardBits[i] * counterAt(record, kCounters + 4 * i);
    publishRate(context, kForward, record.read(u32(13)).value_or(0), bits);
}

void decodeReverseLinkRate(Record record, C2KContext& context)
{
    constexpr std::size_t kMinimumLength = 1750;
    if (!isLongEnough(record, kMinimumLength, "0x127e", context))
        return;
    std::uint64_t bits = 0;
    for (std::size_t rate = 0; rate < std::size(kReverseBits); ++rate) {
        std::uint64_t packets = 0;
        for (std::size_t group = 0; group < kReverseGroups; ++group)
            for (const std::size_t first : kReverseCounters)
                for (std::size_t i = 0; i < 4; ++i)
                    packets += counterAt(record, first + kReverseRateSize * rate + kReverseGroupSize * group + 4 * i);
        bits += kReverseBits[rate] * packets;
    }
    // One byte later than in the forward link's record.
    publishRate(context, kReverse, record.read(u32(14)).value_or(0), bits);
}

} // namespace kestrum
