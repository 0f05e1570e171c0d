#include "insight/LocalTime.h"

#include "platform/Clock.h"

namespace kestrum {

std::string dayText(const Clock& clock, Date at)
{
    return clock.localText(at, "yyyy-MM-dd");
}

std::string momentText(const Clock& clock, Date at, std::string_view today)
{
    auto time = clock.localText(at, "HH:mm:ss");
    const auto day = dayText(clock, at);
    return day == today ? time : day + ' ' + time;
}

} // namespace kestrum
