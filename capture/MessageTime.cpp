#include "capture/MessageTime.h"

#include "platform/ChannelMessage.h"
#include "platform/PropertyLists.h"

#include <algorithm>
#include <string>

namespace kestrum {
namespace {

using namespace std::chrono;

constexpr Date kFirst = sys_days(year{1970} / January / 1), kBehindLast = sys_days(year{2100} / January / 1);

/// Takes ".125" from the beginning of the text. Nothing for a point without a digit.
std::optional<microseconds> takeFraction(std::string_view& text)
{
    microseconds fraction{0};
    if (!text.starts_with('.'))
        return fraction;
    text.remove_prefix(1);
    const auto digits = std::min(text.find_first_not_of("0123456789"), text.size());
    if (digits == 0)
        return std::nullopt;
    microseconds unit = 100ms;
    for (const char digit : text.substr(0, digits)) {
        fraction += unit * (digit - '0');
        unit /= 10; // 0 behind the microseconds
    }
    text.remove_prefix(digits);
    return fraction;
}

} // namespace

std::optional<Date> momentFromText(std::string_view text)
{
    constexpr std::size_t kSeconds = std::string_view("2026-11-16T06:05:42").size(), kSeparator = 10;
    constexpr std::string_view kIsoEnd = "Z", kDisplayEnd = " +0000";
    if (text.size() <= kSeconds)
        return std::nullopt;
    const bool isIso = text[kSeparator] == 'T';
    auto whole = std::string(text.substr(0, kSeconds)).append(kIsoEnd);
    if (text[kSeparator] == ' ')
        whole[kSeparator] = 'T';
    text.remove_prefix(kSeconds);
    const auto date = dateFromIso(whole);
    const auto fraction = takeFraction(text);
    if (!date || !fraction || text != (isIso ? kIsoEnd : kDisplayEnd) || *date < kFirst || *date >= kBehindLast)
        return std::nullopt;
    return *date + *fraction;
}

std::optional<Date> timeOf(const ChannelMessage& record)
{
    const auto stamp = record.timeStamp().value_or(0);
    return stamp != 0 ? std::optional(dateFromTimeStamp(stamp)) : std::nullopt;
}

std::optional<Date> timeOf(const Value& tree)
{
    const auto* root = tree.borrowedDictionary();
    const auto* time = root != nullptr ? std::as_const(*root).find("Time") : nullptr;
    const auto* text = time != nullptr ? time->borrowedString() : nullptr;
    return text != nullptr ? momentFromText(*text) : std::nullopt;
}

std::optional<Date> timeOf(Bytes message, PropertyLists& lists)
{
    if (const auto read = ChannelMessage::read(message); read && read->isOfKnownType())
        return timeOf(*read);
    return isPropertyList(message) ? timeOf(lists.parse(message)) : std::nullopt;
}

} // namespace kestrum
