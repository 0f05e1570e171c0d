#include "ui/Freeze.h"

#include "platform/Clock.h"
#include "ui/KestrumPaneController.h"

#include <utility>

namespace kestrum {
namespace {

constexpr std::string_view kTime = "HH:mm:ss";
constexpr std::size_t kEntries = 5; // of a snapshot

} // namespace

bool Freeze::begin()
{
    if (!go(_moments.newest()))
        return false;
    _since = _shown->time;
    _first = _shown->number;
    return true;
}

bool Freeze::go(std::optional<Moment> to)
{
    if (!to)
        return false;
    _shown = std::move(to);
    KestrumModelNode::makeTreeFromObject(_shown->display(), _nodes);
    return true;
}

KestrumModelNodeRef Freeze::nodeOf(KestrumPaneController& pane) const
{
    if (auto node = _nodes.find(pane.path()))
        return node;
    // The pane stays open: at another moment its node is there.
    return std::make_shared<KestrumModelTreeNode>(pane.screen().title(), KestrumModelNodes());
}

std::string Freeze::status() const
{
    const auto since = _clock.localText(_since, kTime);
    return _shown->number == _first ? "Frozen since " + since
                                    : _clock.localText(_shown->time, kTime) + ", frozen since " + since;
}

ArrayRef Freeze::history() const
{
    return _moments.entriesUpTo(*_shown, kEntries);
}

} // namespace kestrum
