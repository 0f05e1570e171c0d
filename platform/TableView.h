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

/// Rows of one section, as many as fit, drawn with few cells.
class TableView {
public:
    virtual ~TableView() = default;

    /// Asks the data source for everything anew. Scroll offset, selection, focus and a row's sideways scroll stay.
    virtual void reloadData() = 0;

    /// Within `cellForRowAtIndexPath`: a cell that may be used again for that row, of whatever kind; the cell that
    /// last showed that same row comes first. Null when there is none.
    virtual std::shared_ptr<ReusableCell> dequeueReusableCell(std::string_view reuseIdentifier) = 0;

    /// A new cell for this table. Its content area has the width of the table's rows from the start, so that it can
    /// be laid out before the table takes it.
    virtual std::unique_ptr<TableCell> makeCell(CellStyle style) = 0;

    virtual void deselectRow(IndexPath indexPath, bool animated) = 0;
    virtual void sizeToFit() = 0;
};

/// What a table shows, and who is told of its selection. Asked again whenever the table's width changes.
class TableDataSource {
public:
    virtual ~TableDataSource() = default;
    virtual std::size_t numberOfRowsInSection(TableView& table, std::size_t section) = 0;
    /// Never null.
    virtual std::shared_ptr<ReusableCell> cellForRowAtIndexPath(TableView& table, IndexPath indexPath) = 0;
    virtual void didSelectRowAtIndexPath(TableView& table, std::optional<IndexPath> indexPath) = 0;
};

} // namespace kestrum
