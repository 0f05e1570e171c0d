#pragma once

#include "platform/TableCell.h"

#include <memory>
#include <string>
#include <string_view>
#include <utility>

namespace kestrum {

/// A cell that a table keeps for reuse. Controllers derive from it to own the views that they added.
class ReusableCell {
public:
    ReusableCell(std::unique_ptr<TableCell> cell, std::string_view reuseIdentifier)
        : _cell(std::move(cell)), _reuseIdentifier(reuseIdentifier)
    {}
    virtual ~ReusableCell() = default;

    TableCell& cell() { return *_cell; }
    const std::string& reuseIdentifier() const { return _reuseIdentifier; }

private:
    std::unique_ptr<TableCell> _cell;
    std::string _reuseIdentifier;
};

} // namespace kestrum
