#include "support/CsvCells.h"

#include "support/Format.h"

#include <algorithm>
#include <utility>

namespace kestrum {
namespace {

/// "-98.25 dBm": a sign, a number, and optionally a blank and a unit.
bool isNumber(std::string_view raw)
{
    raw.remove_prefix(raw.starts_with('+') || raw.starts_with('-') ? 1 : 0);
    std::size_t digits = 0, points = 0;
    for (; digits < raw.size() && (raw[digits] == '.' || (raw[digits] >= '0' && raw[digits] <= '9')); ++digits)
        points += raw[digits] == '.' ? 1u : 0u;
    if (digits == points || points > 1)
        return false;
    const auto unit = raw.substr(digits);
    return unit.empty() || (unit.front() == ' ' && std::ranges::all_of(unit, [](char c) {
                                return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || c == '%' || c == '/' ||
                                       c == ' ';
                            }));
}

} // namespace

void appendCell(std::string& to, std::string_view raw)
{
    if (std::ranges::none_of(raw, [](char c) { return c == '"' || c == ',' || c == '\r' || c == '\n'; })) {
        to += raw;
        return;
    }
    to += '"';
    for (const char each : raw)
        to.append(each == '"' ? 2 : 1, each);
    to += '"';
}

void appendGuardedCell(std::string& to, std::string_view raw)
{
    const auto begins = [](char c) { return c == '=' || c == '+' || c == '-' || c == '@' || c == '\t' || c == '\r'; };
    if (!raw.empty() && begins(raw.front()) && !isNumber(raw))
        appendCell(to, formatted("'%@", raw));
    else
        appendCell(to, raw);
}

void appendGuardedRow(std::string& to, std::initializer_list<std::string_view> cells)
{
    bool isFirst = true;
    for (const auto cell : cells) {
        if (!std::exchange(isFirst, false))
            to += ',';
        appendGuardedCell(to, cell);
    }
    to += "\r\n";
}

} // namespace kestrum
