#pragma once

#include "LogGenerator/Base.h"
#include "insight/EventTables.h"
#include "support/Reading.h"
#include "support/Value.h"

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

namespace kestrum {

/// The longest text that events and cells keep, in bytes: what a peer sends may be long.
inline constexpr std::size_t kLongestText = 160;

/// The text without what does not fit into `most` bytes; characters stay whole.
std::string shortened(std::string_view text, std::size_t most);

/// A place of a display that is looked at again and again: it costs a comparison as long as its reading stays the same.
class WatchedPlace {
public:
    explicit WatchedPlace(const Place& place);

    /// Finds the container of the place: the section's dictionary, or its list.
    void findIn(const Value& display);
    /// Whether a message of the code may change it, given the nodes that the code reaches.
    bool isReachedBy(LogCode code, const std::optional<std::vector<Value>>& nodes) const;

    /// Whether the reading is the one of the last look. Cheap; false does not mean that it has changed.
    bool isUnchanged() const
    {
        const Value* now = value();
        const auto* reading = now != nullptr ? now->borrowedReading() : nullptr;
        return reading != nullptr && _reading == *reading;
    }
    enum class Seen { Same, Known, Changed };
    /// Compares with the previous look. A value that is absent or empty keeps what was known.
    Seen look();
    /// What was seen last; empty: nothing yet.
    const std::string& text() const { return _text; }
    /// The value now; null when there is none. Not for a place with all rows.
    const Value* value() const
    {
        // Nearly always the key stands where it stood.
        if (const Dictionary* row = _node.dictionary(); row != nullptr && _at < row->size())
            if (const auto& entry = row->begin()[static_cast<std::ptrdiff_t>(_at)]; isSameKey(entry.key, _found))
                return &entry.value;
        return search();
    }

private:
    std::string textNow() const;
    const Value* search() const;

    std::string_view _around, _key; ///< the path of the container; the key in it, or in its rows
    std::optional<std::size_t> _row;
    bool _hasAllRows = false;
    LogCode _code;
    SectionRef _node;
    const void* _address = nullptr; ///< of the container
    mutable std::size_t _at = 0;    ///< where the key was found last ...
    mutable std::string _found;     ///< ... and the key: it may have an order before the name
    std::optional<Reading> _reading;
    std::string _text;
};

} // namespace kestrum
