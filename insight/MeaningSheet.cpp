#include "insight/MeaningSheet.h"

#include "insight/Explanation.h"
#include "insight/ListTable.h"

#include <algorithm>
#include <ranges>
#include <utility>

namespace kestrum {
namespace {

constexpr std::string_view kUnknownKey = "The program has no explanation of this key.";
constexpr std::string_view kUnknownSection = "The program has no explanation of these rows.";
constexpr std::size_t kMostBeside = 500; // values of the pane, from which others follow

Dictionary leavesOf(const KestrumModelNode& pane)
{
    Dictionary leaves;
    for (const auto& each : *pane.childNodes() | std::views::take(kMostBeside))
        if (each->value() != nullptr)
            leaves.setText(each->displayName(), *each->value());
    return leaves;
}

} // namespace

MeaningSheet::MeaningSheet(const Shown& shown, RowOfPane row, const Thresholds& thresholds)
    : _row(std::move(row)), _thresholds(thresholds)
{
    _contents.hint = kUnknownKey;
    update(shown);
}

bool MeaningSheet::update(const Shown& shown)
{
    const auto pane = PathDictionary(std::string(kRootPath), shown.root).find(_row.path);
    const auto* rows = pane ? pane->childNodes() : nullptr;
    if (rows == nullptr)
        return true;
    // Rows may come and go before it.
    const auto isIt = [this](const auto& each) { return each->displayName() == _contents.title; };
    auto row = rows->begin() + static_cast<std::ptrdiff_t>(std::min(_row.row, rows->size()));
    if (!_contents.title.empty() && (row == rows->end() || !isIt(*row)))
        row = std::ranges::find_if(*rows, isIt);
    if (row == rows->end())
        return true;
    _contents.title = (*row)->displayName();
    _contents.parts = {meaningOf(shown.technology, *pane, **row)};
    return true;
}

SheetPart MeaningSheet::meaningOf(std::string_view technology, const KestrumModelNode& pane,
                                  const KestrumModelNode& row) const
{
    SheetPart part;
    const auto path = joinPath(_row.path, row.displayName());
    if (row.value() == nullptr) {
        const auto* section = sectionEntry(technology, path);
        part.lines.emplace_back(section != nullptr ? section->meaning : kUnknownSection);
        return part;
    }
    const auto* entry = keyEntryAt(technology, path);
    part.facts = {{"Value", gradedCell(entry, *row.value(), _thresholds, leafText(pane, kTechnologyKey))},
                  {"Section", {pane.displayName()}}};
    if (entry == nullptr) {
        part.lines.emplace_back(kUnknownKey);
        return part;
    }
    const auto beside = leavesOf(pane);
    auto explanation = explain(*entry, Value(*row.value()), &beside, _thresholds);
    for (auto& [name, text] : std::exchange(explanation.derived, {}))
        part.facts.push_back({std::move(name), {std::move(text)}});
    part.lines = linesOf(explanation);
    return part;
}

} // namespace kestrum
