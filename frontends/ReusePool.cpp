#include "frontends/ReusePool.h"

#include <utility>

namespace kestrum {

void ReusePool::put(std::size_t row, std::shared_ptr<ReusableCell> cell)
{
    _cells.emplace(row, std::move(cell));
}

std::shared_ptr<ReusableCell> ReusePool::take(std::size_t row, std::string_view reuseIdentifier)
{
    // Rows are requested from the top, so the cell of the topmost row is the least likely to be requested again.
    auto found = _cells.end();
    for (auto each = _cells.begin(); each != _cells.end(); ++each) {
        if (each->second->reuseIdentifier() != reuseIdentifier)
            continue;
        if (each->first == row) {
            found = each;
            break;
        }
        if (found == _cells.end() && _cells.size() > _kept)
            found = each;
    }
    return found == _cells.end() ? nullptr : _cells.extract(found).mapped();
}

} // namespace kestrum
