#pragma once

#include "insight/ListTable.h"

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// Whether the node at the path is a list whose elements a table can compare. A list may be empty.
bool isGlanceable(std::string_view technology, std::string_view path, const KestrumModelNode& node);

/// A list of the display as a table, and the order of its rows over several refreshes.
class Glance {
public:
    /// The thresholds outlive it.
    Glance(std::string technology, std::string path, const Thresholds& thresholds)
        : _technology(std::move(technology)), _path(std::move(path)), _thresholds(&thresholds)
    {}

    /// A newer tree. False when the list is gone; nothing changes then. Rows get a new order every second time only,
    /// so that the eye can follow them.
    bool update(const KestrumModelNode& root);
    /// Sorts the rows at once by a column of `part`: levels and numbers greatest first, texts from a to z; the other
    /// way round when they are sorted by that column already.
    void sortBy(std::size_t column);

    const std::string& title() const { return _title; }
    /// The list now: at most this many rows and columns.
    SheetPart part(std::size_t rows = SIZE_MAX, std::size_t columns = SIZE_MAX) const;

private:
    void readServing(const KestrumModelNode& root);
    void order(bool anew);
    std::optional<std::size_t> sortColumn() const;
    bool precedes(const ListTable::Row& left, const ListTable::Row& right, std::size_t column) const;

    /// The column that the user chose, by its key: other columns may come and go.
    struct Choice {
        std::string key, heading;
        bool isDescending;
    };

    std::string _technology, _path, _title;
    const Thresholds* _thresholds;
    ListTable _table;                    ///< its rows in the order in which they are shown
    std::vector<SheetRow::Moved> _moved; ///< of each row
    std::optional<SheetRow> _serving;
    std::vector<SheetFact> _facts;
    std::optional<Choice> _choice;
    std::size_t _age = 0; ///< refreshes since the order was made
    bool _sorted = false; ///< there is an order
};

} // namespace kestrum
