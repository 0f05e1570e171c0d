#pragma once

#include "capture/Position.h"
#include "voxd/Source.h"

#include <chrono>
#include <cstddef>
#include <functional>
#include <optional>
#include <utility>
#include <vector>

namespace kestrum {

class PropertyLists;

/// Adds positions to a log: as records between those of a modem, and as a node of IFX trees.
class PositionTrack {
public:
    /// The least time between two records, of the log's time.
    static constexpr std::chrono::seconds kInterval{1};

    /// `current` gives the position of the moment. `lists` must outlive this object.
    PositionTrack(std::function<std::optional<Position>()> current, PropertyLists& lists)
        : _current(std::move(current)), _lists(lists)
    {}

    /// The position before a record, as a record with the time stamp of that one; a position that is lost as an empty
    /// one, once. To a tree without a node "Position" it adds that node.
    std::optional<std::vector<std::byte>> accompany(Source::Message& message);

private:
    void addTo(std::vector<std::byte>& tree);

    std::function<std::optional<Position>()> _current;
    PropertyLists& _lists;
    std::chrono::microseconds _next{0}; ///< no record before it
    bool _isKnown = false;              ///< by the last record
};

} // namespace kestrum
