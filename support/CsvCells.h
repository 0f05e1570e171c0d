#pragma once

#include <initializer_list>
#include <string>
#include <string_view>

namespace kestrum {

/// Appends a CSV cell (RFC 4180). A cell with a quote, a comma or a line end is put in quotes, and quotes inside it are
/// doubled. Lines end with CR LF.
void appendCell(std::string& to, std::string_view raw);

/// Appends a cell that no spreadsheet takes for a formula: an apostrophe makes it a text.
void appendGuardedCell(std::string& to, std::string_view raw);

/// Appends a line of guarded cells.
void appendGuardedRow(std::string& to, std::initializer_list<std::string_view> cells);

} // namespace kestrum
