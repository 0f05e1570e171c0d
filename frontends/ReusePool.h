#pragma once

#include "platform/ReusableCell.h"

#include <cstddef>
#include <map>
#include <memory>
#include <string_view>

namespace kestrum {

/// The cells of a table that may be used again. A row gets back the cell that last showed it, so that a reload of an
/// unchanged table keeps every row as it was.
class ReusePool {
public:
    /// A row that has no cell in the pool gets another row's cell only when more than `kept` cells wait. Until then
    /// take() returns null, and the caller makes a new cell of the right kind.
    explicit ReusePool(std::size_t kept = 256) : _kept(kept) {}

    /// Adds a cell that no longer shows its row.
    void put(std::size_t row, std::shared_ptr<ReusableCell> cell);
    /// Null when no cell has that identifier.
    std::shared_ptr<ReusableCell> take(std::size_t row, std::string_view reuseIdentifier);
    void clear() { _cells.clear(); }

private:
    std::size_t _kept;
    std::multimap<std::size_t, std::shared_ptr<ReusableCell>> _cells;
};

} // namespace kestrum
