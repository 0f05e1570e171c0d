#pragma once

#include <QString>
#include <cstddef>

namespace kestrum::qt {

class Table;

/// What a table shows as text: a row is "key<TAB>value", a pane its rows, a line each.
QString rowAsText(Table& table, std::size_t row);
QString paneAsText(Table& table);

void copy(const QString& text);

} // namespace kestrum::qt
