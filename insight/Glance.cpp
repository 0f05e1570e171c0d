#include "insight/Glance.h"

#include <algorithm>
#include <map>
#include <tuple>
#include <utility>

namespace kestrum {
namespace {

constexpr std::size_t kRefreshesOfAnOrder = 2;

} // namespace

bool isGlanceable(std::string_view technology, std::string_view path, const KestrumModelNode& node)
{
    const auto* rows = node.childNodes();
    if (rows == nullptr)
        return false;
    if (!rows->empty())
        return hasNumberedRows(node);
    const auto* section = sectionEntry(technology, path);
    return section != nullptr && !section->keys.empty();
}

bool Glance::update(const KestrumModelNode& root)
{
    // The tree belongs to the caller: the paths only borrow it.
    const auto node =
        PathDictionary(std::string(kRootPath), KestrumModelNodeRef(KestrumModelNodeRef(), &root)).find(_path);
    if (!node)
        return false;
    _title = node->displayName();
    auto before = std::exchange(_table, readList(_technology, _path, *node, *_thresholds));

    // The rows of before keep their places, new ones follow.
    std::map<std::string_view, std::size_t> places;
    for (std::size_t i = 0; i < before.rows.size(); ++i)
        places.emplace(before.rows[i].identity, i);
    const auto placeOf = [&](const ListTable::Row& row) {
        const auto found = places.find(row.identity);
        return found != places.end() ? found->second : places.size();
    };
    std::ranges::stable_sort(_table.rows, {}, placeOf);
    order(!_sorted || ++_age >= kRefreshesOfAnOrder);
    readServing(root);
    return true;
}

std::optional<std::size_t> Glance::sortColumn() const
{
    if (_choice)
        for (std::size_t i = 0; i < _table.columns.size(); ++i)
            if (_table.columns[i].key == _choice->key && _table.columns[i].shown.heading == _choice->heading)
                return i;
    return _table.level;
}

bool Glance::precedes(const ListTable::Row& left, const ListTable::Row& right, std::size_t column) const
{
    // Rows without a value are last, in both directions.
    const auto rank = [](const ListTable::Cell& cell) { return cell.number ? 0 : cell.shown.text.empty() ? 2 : 1; };
    if (const int l = rank(left.cells[column]), r = rank(right.cells[column]); l != r)
        return l < r;
    const bool isDescending = !_choice || _choice->isDescending;
    const auto& [lesser, greater] = isDescending ? std::tie(right, left) : std::tie(left, right);
    const auto &a = lesser.cells[column], &b = greater.cells[column];
    return std::tie(a.number, a.shown.text) < std::tie(b.number, b.shown.text);
}

void Glance::order(bool anew)
{
    _moved.assign(_table.rows.size(), SheetRow::Moved::No);
    const auto column = sortColumn();
    if (!anew || !column)
        return;
    _age = 0;
    std::map<std::string, std::size_t> places;
    for (std::size_t i = 0; i < _table.rows.size(); ++i)
        places.emplace(_table.rows[i].identity, i);
    std::ranges::stable_sort(_table.rows,
                             [&](const auto& left, const auto& right) { return precedes(left, right, *column); });
    for (std::size_t i = 0; i < _table.rows.size() && _sorted; ++i) {
        const auto before = places[_table.rows[i].identity];
        _moved[i] = before > i ? SheetRow::Moved::Up : before < i ? SheetRow::Moved::Down : SheetRow::Moved::No;
    }
    _sorted = true;
}

void Glance::sortBy(std::size_t column)
{
    if (column >= _table.columns.size())
        return;
    const auto& chosen = _table.columns[column];
    const bool isSame = sortColumn() == column;
    const bool wasDescending = !_choice || _choice->isDescending;
    const bool greatestFirst = chosen.shown.isNumeric && !chosen.shown.isIdentity;
    _choice = {chosen.key, chosen.shown.heading, isSame ? !wasDescending : greatestFirst};
    order(true);
    std::ranges::fill(_moved, SheetRow::Moved::No); // the user wanted it
}

void Glance::readServing(const KestrumModelNode& root)
{
    _serving.reset();
    _facts.clear();
    const auto* list = sectionEntry(_technology, _path);
    if (list == nullptr)
        return;
    const auto sections = sectionNodes(_technology, root);
    if (list->channel)
        if (const auto* place = findSection(sections, list->channel->section))
            if (const auto* text = leafText(*place->node, list->channel->key); text != nullptr && !text->empty())
                _facts.push_back({std::string(place->section->entry(list->channel->key)->heading), {shortened(*text)}});
    const auto* serving = list->serving.empty() ? nullptr : findSection(sections, list->serving);
    if (serving == nullptr)
        return;
    SheetRow row{.identity = "serving", .isReference = true};
    bool hasText = false; // besides its identity
    for (const auto& column : _table.columns) {
        auto& cell = row.cells.emplace_back();
        const auto* entry = column.entry ? servingCounterpart(_technology, *list, *column.entry) : nullptr;
        const auto* text = entry ? leafText(*serving->node, entry->key) : nullptr;
        if (text == nullptr || text->empty())
            continue;
        cell = column.shown.hasBars ? gradedCell(entry, *text, *_thresholds, leafText(*serving->node, kTechnologyKey))
                                    : SheetCell{shortened(*text)};
        if (std::string_view unit; measured(cell.text, unit) && !unit.empty() && unit == column.shown.unit)
            removeUnit(cell.text, column.shown.unit);
        hasText = hasText || !column.shown.isIdentity;
    }
    if (hasText)
        _serving = std::move(row);
}

SheetPart Glance::part(std::size_t rows, std::size_t columns) const
{
    SheetPart part{.facts = _facts};
    columns = std::min(columns, _table.columns.size());
    for (std::size_t i = 0; i < columns; ++i)
        part.table.columns.push_back(_table.columns[i].shown);
    if (const auto column = sortColumn(); column && *column < columns)
        part.table.sort = {*column, !_choice || _choice->isDescending};
    if (_serving) {
        part.table.rows.push_back(*_serving);
        part.table.rows.back().cells.resize(columns);
    }
    for (std::size_t i = 0; i < std::min(rows, _table.rows.size()); ++i) {
        const auto& from = _table.rows[i];
        SheetRow row{.identity = from.identity, .moved = _moved[i]};
        for (std::size_t column = 0; column < columns; ++column)
            row.cells.push_back(from.cells[column].shown);
        part.table.rows.push_back(std::move(row));
    }
    if (_table.size > _table.rows.size())
        part.note = "The first " + std::to_string(_table.rows.size()) + " of " + std::to_string(_table.size) + " rows.";
    else if (_table.rows.empty())
        part.note = "The list is empty.";
    return part;
}

} // namespace kestrum
