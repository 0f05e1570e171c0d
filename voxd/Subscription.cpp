#include "voxd/Subscription.h"

#include "platform/ChannelMessage.h"

namespace kestrum {
namespace {

constexpr std::int32_t kLargestCode = 0xFFFF;

} // namespace

Subscription::Subscription(const Dictionary& command)
{
    const auto add = [&](std::string_view key, LogCode base) {
        const auto list = command.at(key).array();
        if (!list)
            return;
        if (!_codes)
            _codes.emplace();
        for (const auto& each : *list)
            if (const auto code = each.int32(); code && *code >= 0 && *code <= kLargestCode)
                _codes->insert(base + static_cast<LogCode>(*code));
    };
    add("SetZephraLogCodes", 0);
    add("SetVoxExtraCodes", ChannelMessage::kExtraCodes);
}

bool Subscription::wants(Bytes message) const
{
    if (!_codes)
        return true;
    const auto record = channelRecord(message);
    return !record || _codes->contains(record->code);
}

} // namespace kestrum
