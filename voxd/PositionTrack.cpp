#include "voxd/PositionTrack.h"

#include "capture/PositionRecord.h"
#include "platform/PropertyLists.h"

#include <utility>

namespace kestrum {

std::optional<std::vector<std::byte>> PositionTrack::accompany(Source::Message& message)
{
    const auto record = channelRecord(message.bytes);
    if (!record) {
        if (isPropertyList(message.bytes))
            addTo(message.bytes);
        return std::nullopt;
    }
    if (message.at < _next)
        return std::nullopt;
    const auto position = _current();
    if (!std::exchange(_isKnown, position.has_value()) && !position)
        return std::nullopt;
    _next = message.at + kInterval;
    return positionRecord(position, record->timeStamp, _lists);
}

void PositionTrack::addTo(std::vector<std::byte>& tree)
{
    const Value list = _lists.parse(tree);
    auto* const root = list.borrowedDictionary();
    if (root == nullptr || root->contains(kPositionNode))
        return;
    root->set(kPositionNode, positionNode(_current()));
    if (const auto written = _lists.toXml(list))
        tree.assign(written->bytes().begin(), written->bytes().end());
}

} // namespace kestrum
