#pragma once

#include <algorithm>
#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace kestrum::qt {

/// Follows a row of a table by its name while rows are added and removed around it. When the row itself is removed,
/// the row below replaces it, or else the row above. Equal names are distinguished by their order.
///
/// `nameOf(i)` returns the name of row i as a std::string, for each i below `rows`.
class FollowedRow {
public:
    std::optional<std::size_t> row() const { return _row; }
    void clear() { _row.reset(); }

    template <class NameOf>
    void set(std::size_t row, std::size_t rows, const NameOf& nameOf)
    {
        _row = row;
        _names = {nameOf(row)};
        if (row + 1 < rows)
            _names.push_back(nameOf(row + 1));
        if (row > 0)
            _names.push_back(nameOf(row - 1));
    }

    /// Call it when the rows have changed.
    template <class NameOf>
    void follow(std::size_t rows, const NameOf& nameOf)
    {
        if (!_row)
            return;
        if (rows == 0)
            return clear();
        const std::size_t last = std::min(*_row, rows - 1);
        for (const auto& name : _names)
            if (const auto found = nearest(name, last, rows, nameOf))
                return set(*found, rows, nameOf);
        set(last, rows, nameOf);
    }

private:
    template <class NameOf>
    static std::optional<std::size_t> nearest(const std::string& name, std::size_t to, std::size_t rows,
                                              const NameOf& nameOf)
    {
        for (std::size_t away = 0; away < rows; ++away) {
            if (away <= to && nameOf(to - away) == name)
                return to - away;
            if (away > 0 && to + away < rows && nameOf(to + away) == name)
                return to + away;
        }
        return std::nullopt;
    }

    std::optional<std::size_t> _row;
    std::vector<std::string> _names; ///< the row's name, then its neighbours' names
};

} // namespace kestrum::qt
