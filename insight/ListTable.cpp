#include "insight/ListTable.h"

#include "insight/Explanation.h"
#include "insight/NumberIn.h"
#include "insight/WatchedPlace.h"

#include <algorithm>
#include <map>
#include <ranges>

namespace kestrum {
namespace {

constexpr std::size_t kMostRows = 500;
constexpr std::size_t kMostUnknownColumns = 48; // keys that the key table does not have
constexpr std::size_t kMostValues = 20'000;     // leaves that are looked at
constexpr std::size_t kLongestCell = 200;       // bytes
constexpr std::size_t kLongestUnit = 8;
constexpr std::size_t kMostSections = 500, kDeepestSection = 6;

bool isNumber(std::string_view text)
{
    return !text.empty() && std::ranges::all_of(text, [](char c) { return c >= '0' && c <= '9'; });
}

/// "(ref pilot) -9.07 dB" without the remark.
std::string_view withoutRemark(std::string_view text)
{
    const auto end = text.find(") ");
    return text.starts_with('(') && end != text.npos ? text.substr(end + 2) : text;
}

bool isLevel(const KeyEntry& entry)
{
    return entry.inRow == InRow::Level;
}

/// Collects the columns while the rows are read.
class Columns {
public:
    Columns(std::string_view technology, std::string_view path)
        : _technology(technology), _path(path), _section(sectionEntry(technology, path))
    {}

    /// The column of a key; nothing when there are too many.
    std::optional<std::size_t> of(std::string_view key)
    {
        if (const auto found = _byKey.find(key); found != _byKey.end())
            return found->second;
        const KeyEntry* entry = _section != nullptr ? _section->entry(key) : nullptr;
        if (entry == nullptr) {
            if (_unknown == kMostUnknownColumns)
                return std::nullopt;
            ++_unknown;
            entry = keyEntry(_technology, _path, key); // a key of any section, for a tree that the modem chose
        }
        return append(key, entry, entry != nullptr ? entry->heading : key);
    }
    /// The columns of rows that are only a name and a value. The names of such rows are the PN offsets of pilots where
    /// the key table knows any number as a key, else indexes.
    std::size_t ofNames()
    {
        if (!_names)
            _names = append({}, nullptr, _section != nullptr && _section->entry("0") != nullptr ? "PN" : "#");
        return *_names;
    }
    std::size_t ofValues(std::string_view title)
    {
        if (!_values) {
            const KeyEntry* entry = _section != nullptr ? _section->entry("0") : nullptr;
            if (entry == nullptr)
                entry = keyEntryAt(_technology, _path);
            _values = append({}, entry, entry != nullptr ? entry->heading : title);
        }
        return *_values;
    }

    std::vector<ListTable::Column> take() { return std::move(_columns); }
    std::optional<std::size_t> names() const { return _names; }

    /// A lower rank comes first.
    std::size_t rank(const ListTable::Column& column, std::size_t index) const
    {
        if (index == _names)
            return 0;
        const KeyEntry* entry = column.entry;
        if (entry == nullptr || _section == nullptr || entry < _section->keys.data() ||
            entry >= _section->keys.data() + _section->keys.size())
            return 1000 + index;
        const auto place = static_cast<std::size_t>(entry - _section->keys.data());
        return entry->inRow == InRow::Identity ? 1 + place : isLevel(*entry) ? 200 : 300 + place;
    }

private:
    std::size_t append(std::string_view key, const KeyEntry* entry, std::string_view heading)
    {
        _columns.push_back({shortened(key), entry, {.heading = shortened(heading)}});
        if (!key.empty())
            _byKey.emplace(key, _columns.size() - 1);
        return _columns.size() - 1;
    }

    std::string_view _technology, _path;
    const SectionEntry* _section;
    std::vector<ListTable::Column> _columns;
    std::map<std::string_view, std::size_t> _byKey; // views of the nodes' names
    std::optional<std::size_t> _names, _values;
    std::size_t _unknown = 0;
};

/// Moves the unit of a column into its heading where all its numbers have the same.
void takeUnit(ListTable& table, std::size_t column)
{
    std::optional<std::string> common;
    for (const auto& row : table.rows) {
        std::string_view unit;
        if (!measured(row.cells[column].shown.text, unit))
            continue;
        if (common && *common != unit)
            return;
        common = unit;
    }
    if (!common || common->empty())
        return;
    table.columns[column].shown.unit = *common;
    for (auto& row : table.rows)
        if (std::string_view unit; measured(row.cells[column].shown.text, unit))
            removeUnit(row.cells[column].shown.text, *common);
}

/// A row's identity columns tell it from the others; equal ones are counted.
void nameRows(ListTable& table)
{
    std::map<std::string, std::size_t> seen;
    for (auto& row : table.rows) {
        for (std::size_t column = 0; column < table.columns.size() && table.columns[column].shown.isIdentity; ++column)
            row.identity += row.cells[column].shown.text + '/';
        if (const auto before = seen[row.identity]++; before > 0)
            row.identity += '#' + std::to_string(before);
    }
}

/// Puts the columns, and the cells with them, into the order of their ranks.
void arrange(ListTable& table, const Columns& columns)
{
    std::vector<std::size_t> order(table.columns.size());
    for (std::size_t i = 0; i < order.size(); ++i)
        order[i] = i;
    std::ranges::stable_sort(order, {}, [&](std::size_t index) { return columns.rank(table.columns[index], index); });
    const auto arranged = [&](auto& all) {
        std::remove_reference_t<decltype(all)> moved;
        moved.reserve(order.size());
        for (const std::size_t from : order)
            moved.push_back(std::move(all[from]));
        all = std::move(moved);
    };
    arranged(table.columns);
    for (auto& row : table.rows) {
        row.cells.resize(order.size());
        arranged(row.cells);
    }
}

void addSections(std::string_view technology, const KestrumModelNode& node, const std::string& path, std::size_t depth,
                 std::size_t& visited, std::vector<SectionNode>& sections)
{
    if (++visited > kMostSections || depth > kDeepestSection)
        return;
    if (const auto* section = sectionEntry(technology, path))
        sections.push_back({section, path, &node});
    if (hasNumberedRows(node))
        return;
    for (const auto& child : *node.childNodes() | std::views::take(kMostSections))
        if (child->childNodes() != nullptr)
            addSections(technology, *child, joinPath(path, child->displayName()), depth + 1, visited, sections);
}

} // namespace

bool hasNumberedRows(const KestrumModelNode& node)
{
    const auto* rows = node.childNodes();
    return rows != nullptr && !rows->empty() &&
           std::ranges::all_of(*rows | std::views::take(kMostRows),
                               [](const auto& row) { return isNumber(row->displayName()); });
}

std::string shortened(std::string_view text)
{
    return shortened(text, kLongestCell);
}

std::optional<double> measured(std::string_view text, std::string_view& unit)
{
    const Value value(withoutRemark(text));
    const auto found = numberIn(value);
    // "800 MHz cellular band [0]" begins with a number and is a name.
    if (!found || found->unit.size() > kLongestUnit || found->unit.find(' ') != found->unit.npos)
        return std::nullopt;
    unit = text.substr(text.size() - found->unit.size());
    return found->number;
}

SheetCell gradedCell(const KeyEntry* entry, std::string_view text, const Thresholds& thresholds,
                     const std::string* technology)
{
    SheetCell cell{.text = shortened(text)};
    if (entry == nullptr || entry->kind == Kind::Identity)
        return cell;
    const Value value(withoutRemark(cell.text));
    if (const auto number = numberOf(*entry, value); number && entry->in.scale) {
        const auto [least, greatest] = *entry->in.scale;
        cell.bar = std::clamp((*number - least) / (greatest - least), 0.0, 1.0);
    }
    Dictionary beside;
    if (technology != nullptr)
        beside.setText(kTechnologyKey, *technology);
    if (const auto verdict = verdictOf(*entry, value, &beside, thresholds))
        cell.word = word(verdict->grade);
    return cell;
}

void removeUnit(std::string& text, std::string_view unit)
{
    text.resize(text.size() - unit.size());
    if (text.ends_with(' '))
        text.pop_back();
}

const std::string* leafText(const KestrumModelNode& node, std::string_view key)
{
    const auto* leaves = node.childNodes();
    if (leaves == nullptr)
        return nullptr;
    for (const auto& leaf : *leaves | std::views::take(kMostValues))
        if (leaf->value() != nullptr && leaf->displayName() == key)
            return leaf->value();
    return nullptr;
}

ListTable readList(std::string_view technology, std::string_view path, const KestrumModelNode& node,
                   const Thresholds& thresholds)
{
    ListTable table;
    const auto* elements = node.childNodes();
    if (elements == nullptr)
        return table;
    table.size = elements->size();
    Columns columns(technology, path);
    std::size_t values = 0;
    const auto set = [](ListTable::Row& row, std::size_t column, std::string_view text) {
        if (row.cells.size() <= column)
            row.cells.resize(column + 1);
        row.cells[column].shown.text = shortened(text);
    };
    for (const auto& element : *elements | std::views::take(kMostRows)) {
        if (values >= kMostValues)
            break;
        auto& row = table.rows.emplace_back();
        if (const auto* text = element->value()) {
            set(row, columns.ofNames(), element->displayName());
            set(row, columns.ofValues(node.displayName()), *text);
            ++values;
            continue;
        }
        for (const auto& leaf : *element->childNodes()) {
            if (++values > kMostValues)
                break;
            if (const auto* text = leaf->value())
                if (const auto column = columns.of(leaf->displayName()))
                    set(row, *column, *text);
        }
    }
    // Rows without an identity have their index for one.
    if (!columns.names())
        columns.ofNames();
    const auto names = *columns.names();
    table.columns = columns.take();
    const bool identified = std::ranges::any_of(table.columns, [](const auto& column) {
        return column.entry != nullptr && column.entry->inRow == InRow::Identity;
    });
    for (std::size_t i = 0; i < table.rows.size(); ++i)
        if (auto& cells = table.rows[i].cells; cells.size() <= names || cells[names].shown.text.empty())
            set(table.rows[i], names, (*elements)[i]->displayName());
    arrange(table, columns);
    if (identified) {
        table.columns.erase(table.columns.begin());
        for (auto& row : table.rows)
            row.cells.erase(row.cells.begin());
    }

    const auto technologies = std::ranges::find(table.columns, kTechnologyKey, &ListTable::Column::key);
    for (std::size_t i = 0; i < table.columns.size(); ++i) {
        auto& [key, entry, shown] = table.columns[i];
        shown.isIdentity = entry == nullptr ? i == 0 && !identified : entry->inRow == InRow::Identity;
        if (!table.level && entry != nullptr && (isLevel(*entry) || entry->in.measure != Measure::None))
            table.level = i;
        shown.hasBars = table.level == i;
        for (auto& row : table.rows) {
            auto& cell = row.cells[i];
            std::string_view unit;
            cell.number = entry != nullptr ? numberOf(*entry, Value(withoutRemark(cell.shown.text))) : std::nullopt;
            if (!cell.number)
                cell.number = measured(cell.shown.text, unit);
            if (shown.hasBars)
                cell.shown = gradedCell(
                    entry, cell.shown.text, thresholds,
                    technologies != table.columns.end()
                        ? &row.cells[static_cast<std::size_t>(technologies - table.columns.begin())].shown.text
                        : nullptr);
            shown.isNumeric = shown.isNumeric || cell.number;
        }
    }
    nameRows(table);
    for (std::size_t i = 0; i < table.columns.size(); ++i)
        takeUnit(table, i);
    return table;
}

std::vector<SectionNode> sectionNodes(std::string_view technology, const KestrumModelNode& root)
{
    std::vector<SectionNode> sections;
    std::size_t visited = 0;
    if (root.childNodes() != nullptr)
        addSections(technology, root, std::string(kRootPath), 0, visited, sections);
    return sections;
}

const SectionNode* findSection(const std::vector<SectionNode>& sections, std::string_view name)
{
    const auto found = std::ranges::find(sections, name, [](const auto& each) { return each.section->name; });
    return found != sections.end() ? &*found : nullptr;
}

} // namespace kestrum
