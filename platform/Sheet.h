#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace kestrum {

/// A value of a sheet.
struct SheetCell {
    std::string text = {};
    std::optional<double> bar = {}; ///< the value's place on the scale of its key, 0 to 1; nothing for no bar
    std::string word = {};          ///< how good it is ("good"); empty when it is not graded

    friend bool operator==(const SheetCell&, const SheetCell&) = default;
};

struct SheetColumn {
    std::string heading;
    std::string unit = {};   ///< of all numbers of the column; empty when they have none, or have it themselves
    bool isNumeric = false;  ///< numbers stand against the right edge
    bool hasBars = false;    ///< and words
    bool isIdentity = false; ///< stays in view when the others are scrolled sideways; such columns come first

    friend bool operator==(const SheetColumn&, const SheetColumn&) = default;
};

struct SheetRow {
    /// Since the last contents.
    enum class Moved { No, Up, Down };

    std::string identity = {};         ///< the row's own, whatever its place is
    std::vector<SheetCell> cells = {}; ///< one for each column
    Moved moved = Moved::No;
    bool isReference = false; ///< the serving cell, with which the others are compared: it comes first

    friend bool operator==(const SheetRow&, const SheetRow&) = default;
};

struct SheetSort {
    std::size_t column;
    bool isDescending;

    friend bool operator==(const SheetSort&, const SheetSort&) = default;
};

struct SheetTable {
    std::vector<SheetColumn> columns = {};
    std::vector<SheetRow> rows = {};
    std::optional<SheetSort> sort = {}; ///< nothing: the order of the display

    friend bool operator==(const SheetTable&, const SheetTable&) = default;
};

struct SheetFact {
    std::string heading;
    SheetCell value;

    friend bool operator==(const SheetFact&, const SheetFact&) = default;
};

/// Facts, and a table under them.
struct SheetPart {
    std::string caption = {};
    std::vector<SheetFact> facts = {};
    SheetTable table = {};
    std::string note = {}; ///< about the table; empty for none

    friend bool operator==(const SheetPart&, const SheetPart&) = default;
};

struct SheetContents {
    std::string title = {};
    std::vector<SheetPart> parts = {};
    std::string hint = {}; ///< what is said when there are no parts
    std::string status = {};
    bool canSort = false; ///< whether the user may choose the column by which the first part's table is sorted

    friend bool operator==(const SheetContents&, const SheetContents&) = default;
};

/// What a sheet reports.
class SheetOwner {
public:
    virtual ~SheetOwner() = default;
    /// The user closes the sheet. The owner destroys it.
    virtual void sheetLeft() = 0;
    /// The user chose a column for the order of the rows; again: the reverse order.
    virtual void columnChosen(std::size_t column) = 0;
};

/// A screen over the panes, with facts and tables that the user can only read. It is shown, and takes all input, from
/// its creation to its destruction.
class Sheet {
public:
    virtual ~Sheet() = default;
    /// Replaces the contents. Place, choice and sideways scroll stay, with the identity of the rows.
    virtual void setContents(SheetContents contents) = 0;
};

} // namespace kestrum
