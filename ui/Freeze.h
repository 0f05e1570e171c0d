#pragma once

#include "core/KestrumModelNode.h"
#include "insight/Moments.h"

#include <cstdint>
#include <optional>
#include <string>

namespace kestrum {

class Clock;
class KestrumPaneController;

/// The moment at which the panes stand still, while the model goes on.
class Freeze {
public:
    Freeze(const Moments& moments, const Clock& clock) : _moments(moments), _clock(clock) {}

    bool isOn() const { return _shown.has_value(); }
    /// The moment that is shown; nothing while the panes follow the modem.
    const std::optional<Moment>& moment() const { return _shown; }
    /// Stands still at the newest moment. False when there is none.
    bool begin();
    void end() { _shown.reset(); }

    /// Goes to the moment before or after. False when there is none.
    bool goEarlier() { return go(_moments.before(*_shown)); }
    bool goLater() { return go(_moments.after(*_shown)); }
    bool hasEarlier() const { return _moments.before(*_shown).has_value(); }
    bool hasLater() const { return _moments.after(*_shown).has_value(); }

    /// The pane's node at that moment; without rows, under its old name, where there was none.
    KestrumModelNodeRef nodeOf(KestrumPaneController& pane) const;
    /// "Frozen since 06:05:44", or "06:05:40, frozen since 06:05:44".
    std::string status() const;
    /// The history as it was at that moment.
    ArrayRef history() const;

private:
    bool go(std::optional<Moment> to);

    const Moments& _moments;
    const Clock& _clock;
    std::optional<Moment> _shown; ///< present while the panes stand still
    std::uint64_t _first = 0;     ///< the moment at which they stopped
    Date _since;                  ///< its time
    PathDictionary _nodes;        ///< of the moment that is shown
};

} // namespace kestrum
