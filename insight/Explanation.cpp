#include "insight/Explanation.h"

#include "insight/NumberIn.h"
#include "support/Format.h"

#include <algorithm>
#include <limits>

namespace kestrum {
namespace {

/// The usual level of RXLEV n, in dBm: the upper end of its step (3GPP TS 45.008, 8.1.4).
double levelOfRxLev(double index)
{
    return index - 110;
}

/// In a tree of several technologies RSSI is a received level only for GSM.
bool isOtherThanGsm(const Dictionary* beside)
{
    if (beside == nullptr)
        return false;
    const auto found =
        std::ranges::find_if(*beside, [](const auto& entry) { return shownName(entry.key) == "Technology"; });
    return found != beside->end() && found->value.isText() && found->value != "GSM";
}

} // namespace

std::optional<double> numberOf(const KeyEntry& entry, const Value& value)
{
    const auto measured = numberIn(value);
    if (!measured)
        return std::nullopt;
    return numberOf(entry, measured->number, measured->unit);
}

std::optional<double> numberOf(const KeyEntry& entry, double number, std::string_view unit)
{
    if (unit == entry.in.unit)
        return number;
    if (unit != entry.in.secondUnit)
        return std::nullopt;
    return unit.empty() && entry.in.measure == Measure::RxLev ? levelOfRxLev(number) : number;
}

std::optional<Verdict> verdictOf(const KeyEntry& entry, const Value& value, const Dictionary* beside,
                                 const Thresholds& thresholds)
{
    const auto number = numberOf(entry, value);
    if (!number)
        return std::nullopt;
    if (entry.in.measure != Measure::RxLev)
        return thresholds.grade(entry.in.measure, *number);
    if (isOtherThanGsm(beside))
        return std::nullopt;
    return thresholds.grade(Measure::RxLev, entry.in.unit.empty() ? levelOfRxLev(*number) : *number);
}

std::vector<GradeBand> bandsOf(const KeyEntry& entry, const Dictionary* beside, const Thresholds& thresholds)
{
    using enum Grade;
    const bool isRxLev = entry.in.measure == Measure::RxLev;
    const auto* limits = isRxLev && isOtherThanGsm(beside) ? nullptr : thresholds.limitsOf(entry.in.measure);
    if (limits == nullptr)
        return {};
    const double shift = isRxLev && entry.in.unit.empty() ? levelOfRxLev(0) : 0;
    const auto at = [shift](double limit) { return limit - shift; };
    constexpr double kLeast = -std::numeric_limits<double>::infinity();
    const auto& [measure, excellent, good, fair, poor] = *limits;
    if (poor < excellent)
        return {{kLeast, NoService}, {at(poor), Poor}, {at(fair), Fair}, {at(good), Good}, {at(excellent), Excellent}};
    return {{kLeast, Excellent}, {at(excellent), Good}, {at(good), Fair}, {at(fair), Poor}, {at(poor), NoService}};
}

Explanation explain(const KeyEntry& entry, const Value& value, const Dictionary* beside, const Thresholds& thresholds)
{
    return {entry.key, entry.meaning, entry.standard,
            entry.derive != nullptr ? entry.derive(Given{value, beside}) : DerivedValues(),
            verdictOf(entry, value, beside, thresholds)};
}

std::vector<std::string> linesOf(const Explanation& explanation)
{
    std::vector<std::string> lines{std::string(explanation.meaning)};
    for (const auto& [name, text] : explanation.derived)
        lines.push_back(formatted("%s: %s", name, text));
    if (const auto& verdict = explanation.verdict)
        lines.push_back(formatted("This value: %s, by profile %s (%s)", word(verdict->grade), verdict->profile,
                                  verdict->source.substr(0, verdict->source.find_last_not_of('.') + 1)));
    if (!explanation.standard.empty())
        lines.push_back(formatted("Standard: %s", explanation.standard));
    return lines;
}

} // namespace kestrum
