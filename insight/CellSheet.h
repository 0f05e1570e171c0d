#pragma once

#include "insight/SheetSource.h"

namespace kestrum {

class Clock;
class History;

/// The cells that have served: first those that serve now, then the latest.
class CellSheet final : public SheetSource {
public:
    static constexpr std::size_t kMostRows = 500;

    CellSheet(History& history, const Clock& clock);

    bool update(const Shown& shown) override;

private:
    History& _history;
    const Clock& _clock;
};

} // namespace kestrum
