#pragma once

#include "platform/ReusableCell.h"

#include <cstddef>
#include <memory>
#include <optional>
#include <string_view>

namespace kestrum {

struct IndexPath {
    std::size_t section = 0, row = 0;
};

/// A table with one section. It draws the visible rows with few cells, which it reuses.
class TableView {
public:
    virtual ~TableView() = default;

    /// Asks the data source for all rows again. Keeps scroll offset, selection, focus and the rows' sideways scroll.
    virtual void reloadData() = 0;

    /// Called from `cellForRowAtIndexPath`: a cell to reuse for the row, of any kind, preferably the one that showed
    /// the same row before. Null when there is none.
    virtual std::shared_ptr<ReusableCell> dequeueReusableCell(std::string_view reuseIdentifier) = 0;

    /// A new cell for this table. Its content area has the width of the table's rows, so that the caller can lay it out
    /// at once.
    virtual std::unique_ptr<TableCell> makeCell(CellStyle style) = 0;

    virtual void deselectRow(IndexPath indexPath, bool animated) = 0;
    virtual void sizeToFit() = 0;
};

/// Provides a table's rows and receives its selection. The table asks again when its width changes.
class TableDataSource {
public:
    virtual ~TableDataSource() = default;
    virtual std::size_t numberOfRowsInSection(TableView& table, std::size_t section) = 0;
    /// Never null.
    virtual std::shared_ptr<ReusableCell> cellForRowAtIndexPath(TableView& table, IndexPath indexPath) = 0;
    virtual void didSelectRowAtIndexPath(TableView& table, std::optional<IndexPath> indexPath) = 0;
};

} // namespace kestrum
