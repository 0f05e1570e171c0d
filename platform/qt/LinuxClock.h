#pragma once

#include "platform/Clock.h"

namespace kestrum {

/// The system's clock, time zone (TZ) and locale.
class LinuxClock final : public Clock {
public:
    Date now() const override;
    Zone zoneAt(Date date) const override;
    std::string localText(Date date, std::string_view pattern) const override;
};

} // namespace kestrum
