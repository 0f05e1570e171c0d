#include "LogGenerator/C2K/Decoders.h"
#include "LogGenerator/C2K/Subpackets.h"
#include "platform/SystemLog.h"

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 17;
constexpr std::uint32_t kDemodulationSubpacket = 11;

constexpr Field kFrameError = u8(24); // from the subpacket's first byte; not 0: the frame was bad

// An exponential average over about 64 frames, in single precision.
constexpr float kNewWeight = 0.015625F;
constexpr float kOldWeight = 0.984375F;

std::string frameErrors(double percent)
{
    return formatted("%.02f%%", percent);
}
constexpr Quantity kFrameErrors = computedQuantity<frameErrors>("%");

} // namespace

void decodeTrafficDemodulation(Record record, C2KContext& context)
{
    if (record.size() < kMinimumLength) {
        context.rejectLength(formatted("Log code 0x119d is %d bytes long but must be at least %ld bytes.",
                                       static_cast<int>(record.size()), static_cast<long>(kMinimumLength)));
        return;
    }
    const auto subpacket = findSubpacket(record, kDemodulationSubpacket, context.log);
    if (!subpacket) {
        context.log.write(Priority::Warning, "Log code 0x119d: missing traffic demod subpacket.");
        return;
    }
    const auto frameError = subpacket->read(kFrameError);
    if (!frameError)
        return;
    float ratio = *frameError != 0 ? kNewWeight : 0.0F;
    if (const auto previous = context.state.at("TrafficFER").real())
        ratio += static_cast<float>(*previous) * kOldWeight;
    context.state.set("TrafficFER", ratio);
    context.publish("k1xTrafficFER", Reading::computed(kFrameErrors, ratio * 100.0F));
}

} // namespace kestrum
