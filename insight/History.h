#pragma once

#include "capture/RecentMessages.h"
#include "core/DisplayWatch.h"
#include "insight/Events.h"
#include "insight/Moments.h"
#include "insight/Trend.h"

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <string>

namespace kestrum {

class Clock;

/// What a display has shown, and what has happened: filled by a model, whatever is looked at.
class History final : public DisplayWatch {
public:
    explicit History(const Clock& clock) : _clock(clock), _moments(clock) {}

    void displayMade(const Dictionary& entry) override;
    void messageDecoded(const LogGenerator& generator, const State& state, Bytes message) override;
    void messagesLost(std::uint64_t count) override { _recent.addGap(count); }
    void connectionChanged(bool isConnected) override;
    void timePassed(std::chrono::milliseconds time) override;

    const Moments& moments() const { return _moments; }
    const Trends& trends() const { return _trends; }
    /// Those of the last 15 minutes, invalid ones too. Another technology's messages begin anew: a capture is of one.
    const RecentMessages& recent() const { return _recent; }
    const Events& events() const { return _finder.events(); }
    /// Up to the last message.
    const Cells& cells() { return _finder.cells(); }
    /// The refreshes that showed another serving cell first, by the clock of the trends: the messages may have been
    /// recorded long ago. In the order in which they came.
    const std::deque<Date>& cellChanges() const { return _cellChanges; }

private:
    static constexpr std::size_t kMostCellChanges = 5000;

    void markCellChanges(Date now);

    const Clock& _clock;
    Moments _moments;
    Trends _trends;
    RecentMessages _recent;
    EventFinder _finder;
    std::deque<Date> _cellChanges;
    std::uint64_t _marked = 0;           ///< events that have been looked through for cell changes
    std::string _technology;             ///< of the last message
    std::chrono::milliseconds _quiet{0}; ///< since the last message, while the log channel was open
};

} // namespace kestrum
