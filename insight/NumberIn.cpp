#include "insight/NumberIn.h"

#include "support/Format.h"

#include <algorithm>
#include <charconv>
#include <cmath>

namespace kestrum {
namespace {

bool isUnit(std::string_view text)
{
    constexpr std::size_t kLongest = 16;
    return text.size() <= kLongest && std::ranges::all_of(text, [](char c) {
               return (c | 0x20) >= 'a' ? (c | 0x20) <= 'z' : c == '%' || c == '/';
           });
}

std::optional<NumberAndUnit> numberInText(std::string_view text)
{
    // Only digits and a sign begin a number: from_chars would also take "nan" and "inf".
    const auto begin = text.starts_with('+') || text.starts_with('-') ? 1u : 0u;
    if (text.size() <= begin || text[begin] < '0' || text[begin] > '9')
        return std::nullopt;
    double number = 0;
    const auto* first = text.data() + (text.front() == '+' ? 1 : 0);
    const auto [end, error] = std::from_chars(first, text.data() + text.size(), number, std::chars_format::fixed);
    if (error != std::errc() || !std::isfinite(number))
        return std::nullopt;
    auto unit = text.substr(static_cast<std::size_t>(end - text.data()));
    if (unit.starts_with(' '))
        unit.remove_prefix(1);
    else if (!unit.empty() && unit != "%")
        return std::nullopt; // "0x1107", "A5/3", "001-01"
    return isUnit(unit) ? std::optional(NumberAndUnit{number, unit}) : std::nullopt;
}

} // namespace

std::optional<NumberAndUnit> numberIn(const Value& value)
{
    if (const auto* reading = value.borrowedReading()) {
        const auto number = reading->number();
        return number ? std::optional(NumberAndUnit{*number, reading->unit()}) : std::nullopt;
    }
    const auto* text = value.borrowedString();
    return text != nullptr ? numberInText(*text) : std::nullopt;
}

std::string shortText(double number)
{
    auto text = formatted("%.2f", number);
    text.erase(text.find_last_not_of('0') + 1);
    if (text.ends_with('.'))
        text.pop_back();
    return text == "-0" ? "0" : text;
}

std::string withUnit(std::string_view text, std::string_view unit)
{
    return unit.empty() ? std::string(text) : formatted("%@ %@", text, unit);
}

} // namespace kestrum
