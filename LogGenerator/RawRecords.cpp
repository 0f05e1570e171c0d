#include "LogGenerator/RawRecords.h"

#include <algorithm>
#include <utility>

namespace kestrum {
namespace {

// Full blocks in the capacity. Dropping one block so drops at most 1/kBlocks of the capacity too early.
constexpr std::size_t kBlocks = 16;
// An ordinary interval is far smaller. Larger memory is freed after a flood.
constexpr std::size_t kLargestReserve = 1 << 20;

} // namespace

void RawRecords::append(Bytes message)
{
    if (_newest.messages > 0 && _newest.bytes.size() + message.size() > _capacity / kBlocks) {
        _fullBytes += _newest.bytes.size();
        _full.push_back(std::exchange(_newest, {}));
    }
    _newest.bytes.insert(_newest.bytes.end(), message.begin(), message.end());
    ++_newest.messages;
    while (!_full.empty() && _fullBytes + _newest.bytes.size() > _capacity) {
        _dropped += _full.front().messages;
        _fullBytes -= _full.front().bytes.size();
        _full.pop_front();
    }
}

RawRecords::Interval RawRecords::take()
{
    Interval interval{std::exchange(_newest, {}).bytes, std::exchange(_dropped, 0)};
    if (!_full.empty()) {
        std::vector<std::byte> all;
        all.reserve(_fullBytes + interval.bytes.size());
        for (auto& block : _full)
            all.insert(all.end(), block.bytes.begin(), block.bytes.end());
        all.insert(all.end(), interval.bytes.begin(), interval.bytes.end());
        interval.bytes = std::move(all);
        _full.clear();
        _fullBytes = 0;
    }
    // Reserves memory for an interval of the same size.
    _newest.bytes.reserve(std::min(interval.bytes.size() + interval.bytes.size() / 8, kLargestReserve));
    return interval;
}

} // namespace kestrum
