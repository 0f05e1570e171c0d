#pragma once

#include "core/KestrumModelNode.h"
#include "insight/Thresholds.h"
#include "insight/keys/KeyEntry.h"
#include "platform/Sheet.h"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// A list of the display as rows and columns: what its pane and the panes of its elements hold. The most telling
/// columns come first: identity, level, then the order of the key table.
struct ListTable {
    struct Column {
        std::string key; ///< as the panes show it; of the elements' names, or of their values, it is empty
        const KeyEntry* entry = nullptr; ///< may be null
        SheetColumn shown;
    };
    struct Cell {
        SheetCell shown;              ///< a bar and a word only where the column has bars
        std::optional<double> number; ///< in the unit of the column's entry, where it has one
    };
    struct Row {
        std::string identity; ///< unique in the list
        std::vector<Cell> cells;
    };

    std::vector<Column> columns;
    std::vector<Row> rows;
    std::size_t size = 0;             ///< elements of the list, of which `rows` are the first
    std::optional<std::size_t> level; ///< the column by which rows are sorted
};

/// Whether all rows of a node have numbers for names, as the elements of a list have. False without rows.
bool hasNumberedRows(const KestrumModelNode& node);

/// The list at the path. Its cost is bounded, whatever the node holds.
ListTable readList(std::string_view technology, std::string_view path, const KestrumModelNode& node,
                   const Thresholds& thresholds);

/// The number of a text, in its unit; nothing for a text that is no measurement. "(ref pilot) -9.07 dB" has one.
std::optional<double> measured(std::string_view text, std::string_view& unit);

/// A value as a sheet shows it: with its place on the scale of its key, and its grade. Without an entry the text only.
/// `technology` is the text "Technology" beside the value, null where there is none: it tells what a level means.
SheetCell gradedCell(const KeyEntry* entry, std::string_view text, const Thresholds& thresholds,
                     const std::string* technology = nullptr);

/// The key that tells the technology of a cell, where cells of several stand in one tree.
inline constexpr std::string_view kTechnologyKey = "Technology";

/// Takes the unit, and the blank before it, from the end of the text.
void removeUnit(std::string& text, std::string_view unit);

/// The beginning of a text of a sheet: a value can have megabytes.
std::string shortened(std::string_view text);

/// The nodes of the technology's sections. Its cost is bounded.
struct SectionNode {
    const SectionEntry* section;
    std::string path;
    const KestrumModelNode* node; ///< of the tree
};
std::vector<SectionNode> sectionNodes(std::string_view technology, const KestrumModelNode& root);
/// Null when the tree has no such section.
const SectionNode* findSection(const std::vector<SectionNode>& sections, std::string_view name);

/// The text of a node's leaf; null when there is none.
const std::string* leafText(const KestrumModelNode& node, std::string_view key);

} // namespace kestrum
