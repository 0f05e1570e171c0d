#include "support/Date.h"

#include "support/Format.h"

#include <charconv>

namespace kestrum {
namespace {

using namespace std::chrono;

constexpr sys_days kCdmaEpoch = year{1980} / January / 6;
constexpr microseconds kTick{1250};

struct Parts {
    year_month_day day;
    hh_mm_ss<microseconds> time;

    explicit Parts(Date date) : day(floor<days>(date)), time(date - floor<days>(date)) {}
};

std::string dayText(const year_month_day& day)
{
    return formatted("%04d-%02u-%02u", static_cast<int>(day.year()), static_cast<unsigned>(day.month()),
                     static_cast<unsigned>(day.day()));
}

std::string clockText(const hh_mm_ss<microseconds>& time)
{
    return formatted("%02ld:%02ld:%02ld", static_cast<long>(time.hours().count()),
                     static_cast<long>(time.minutes().count()), static_cast<long>(time.seconds().count()));
}

std::optional<int> number(std::string_view digits)
{
    int value = 0;
    const auto [end, error] = std::from_chars(digits.data(), digits.data() + digits.size(), value);
    if (error != std::errc{} || end != digits.data() + digits.size() || digits.front() == '-')
        return std::nullopt;
    return value;
}

} // namespace

std::string dateText(Date date)
{
    const Parts parts(date);
    return dayText(parts.day) + " " + clockText(parts.time) + " +0000";
}

std::string isoText(Date date, int fractionDigits)
{
    const Parts parts(date);
    std::string text = dayText(parts.day) + "T" + clockText(parts.time);
    if (fractionDigits > 0) {
        const auto fraction = formatted("%06ld", static_cast<long>(parts.time.subseconds().count()));
        text += "." + fraction.substr(0, static_cast<std::size_t>(fractionDigits));
    }
    return text + "Z";
}

std::optional<Date> dateFromIso(std::string_view text)
{
    constexpr std::string_view kForm = "dddd-dd-ddTdd:dd:ddZ";
    if (text.size() != kForm.size())
        return std::nullopt;
    for (std::size_t i = 0; i < kForm.size(); ++i)
        if (kForm[i] != 'd' && kForm[i] != text[i])
            return std::nullopt;
    const auto y = number(text.substr(0, 4)), mo = number(text.substr(5, 2)), d = number(text.substr(8, 2));
    const auto h = number(text.substr(11, 2)), mi = number(text.substr(14, 2)), s = number(text.substr(17, 2));
    if (!y || !mo || !d || !h || !mi || !s || *h > 23 || *mi > 59 || *s > 59)
        return std::nullopt;
    const year_month_day day{year{*y}, month{static_cast<unsigned>(*mo)}, std::chrono::day{static_cast<unsigned>(*d)}};
    if (!day.ok())
        return std::nullopt;
    return Date(sys_days(day)) + hours{*h} + minutes{*mi} + seconds{*s};
}

Date dateFromTimeStamp(std::uint64_t timeStamp)
{
    return Date(kCdmaEpoch) + static_cast<std::int64_t>(timeStamp >> 16) * kTick;
}

std::uint64_t timeStampFromDate(Date date)
{
    return static_cast<std::uint64_t>((date - Date(kCdmaEpoch)) / kTick) << 16;
}

} // namespace kestrum
