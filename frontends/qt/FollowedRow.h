#pragma once

#include <algorithm>
#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace kestrum::qt {

/// A row of a table that is followed by its name while rows come and go around it. When the row itself goes, the one
/// below takes its place, or the one above. Names that occur twice are told apart by where they stand.
///
/// `nameOf(i)` gives the name of row i as a std::string, for each i below `rows`.
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

    /// The rows are others now.
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
    std::vector<std::string> _names; ///< its own, then its neighbours'
};

} // namespace kestrum::qt
