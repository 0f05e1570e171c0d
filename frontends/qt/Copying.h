#pragma once

#include <QString>
#include <cstddef>

namespace kestrum::qt {

class Table;

/// The texts of a table for the clipboard: "key<TAB>value" for a row, one such line per row for a pane.
QString rowAsText(Table& table, std::size_t row);
QString paneAsText(Table& table);

void copy(const QString& text);

} // namespace kestrum::qt
