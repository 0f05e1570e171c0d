#pragma once

#include "support/Date.h"
#include "support/Value.h"

#include <cstddef>
#include <cstdint>
#include <deque>
#include <optional>

namespace kestrum {

class Clock;

/// A display as it was at one refresh. A moment that is held stays whole after it has left `Moments`.
struct Moment {
    std::uint64_t number; ///< 1, 2, ...: one more than that of the refresh before
    Date time;            ///< by the clock then: it may be before the time of an earlier moment
    DictionaryRef entry;  ///< a copy of the history entry (StateKey)

    /// The display, as panes show it; null when there was none.
    Value display() const;
};

/// The displays of the last 15 minutes: a copy for each refresh with new data. What has not changed from one refresh to
/// the next is kept once. Bounded: the oldest raw records go first, then the oldest moments.
class Moments {
public:
    struct Limits {
        std::size_t moments = 450;    ///< 15 minutes of refreshes, every 2 s
        std::size_t bytes = 64 << 20; ///< of all copies
    };

    explicit Moments(const Clock& clock) : Moments(clock, Limits{}) {}
    Moments(const Clock& clock, Limits limits) : _clock(clock), _limits(limits) {}

    /// Copies a display; see DisplayWatch.
    void displayMade(const Dictionary& entry);

    std::size_t size() const { return _moments.size(); }
    /// The memory of the copies, containers and texts included.
    std::size_t bytes() const { return _bytes; }

    /// Nothing when there is none.
    std::optional<Moment> newest() const;
    std::optional<Moment> before(const Moment& moment) const;
    std::optional<Moment> after(const Moment& moment) const;

    /// The entries of up to `count` moments, oldest first; `last` is the last of them.
    ArrayRef entriesUpTo(const Moment& last, std::size_t count) const;

private:
    void keepLimits();
    bool dropOldestRawRecords();
    void dropOldest();

    const Clock& _clock;
    Limits _limits;
    std::deque<Moment> _moments; ///< their numbers are consecutive
    std::uint64_t _made = 0;
    std::uint64_t _withoutRaw = 0; ///< the moments up to this number have no raw records any more
    std::size_t _bytes = 0;
};

} // namespace kestrum
