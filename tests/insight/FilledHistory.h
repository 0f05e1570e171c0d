#pragma once

#include "core/KestrumModelNode.h"
#include "doubles/DecodingDoubles.h"
#include "insight/History.h"
#include "insight/NoGenerator.h"
#include "insight/SheetSource.h"

#include <chrono>
#include <string>
#include <string_view>
#include <utility>

namespace kestrum {

/// A history of displays that the test shows, a refresh every 2 s. Messages come at the refreshes.
class FilledHistory {
public:
    explicit FilledHistory(std::string_view technology) : _generator(doubles.roles, technology) {}

    void refresh(const Value& display, std::chrono::microseconds after = std::chrono::seconds(2))
    {
        clock.date += after;
        _state.set(StateKey::kDisplay, display);
        history.messageDecoded(_generator, _state, recordOf(0xB0C0, clock.date - recordedBefore));
        history.displayMade(*makeDictionary({{StateKey::kDisplay, display}}));
    }

    /// What live panes show.
    Shown shown() const { return shownAt(history.moments().newest()); }
    Shown shownAt(std::optional<Moment> moment) const
    {
        if (!moment)
            return {_generator.technology()};
        PathDictionary paths;
        auto root = KestrumModelNode::makeTreeFromObject(moment->display(), paths);
        return {_generator.technology(), std::move(root), std::move(moment)};
    }

    DecodingDoubles doubles;
    VirtualClock& clock = doubles.clock;
    std::chrono::hours recordedBefore{0}; ///< a service may replay old messages
    History history{clock};

private:
    NoGenerator _generator;
    State _state;
};

} // namespace kestrum
