#pragma once

#include "insight/SheetSource.h"

#include <cstdint>
#include <string>

namespace kestrum {

class Clock;
class Events;

/// What happened, newest first.
class EventSheet final : public SheetSource {
public:
    /// More rows than anyone scrolls through. Those that are not shown can be kept as a file.
    static constexpr std::size_t kMostRows = 1000;

    EventSheet(const Events& events, const Clock& clock);

    bool update(const Shown& shown) override;

private:
    const Events& _events;
    const Clock& _clock;
    std::uint64_t _read = 0; ///< events so far
    std::string _today;      ///< for which the times were written
};

} // namespace kestrum
