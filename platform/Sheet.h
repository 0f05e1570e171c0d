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

/// How a value has been, over time. Places are 0 at the left end of the time axis and 1 at the right end, and never
/// decrease.
struct SheetPlot {
    /// A number, or several of one place: equal, unless the point stands for a longer time. Not numbers: a gap, in
    /// which no line is drawn.
    struct Point {
        double at, least, mean, greatest;
        friend bool operator==(const Point&, const Point&) = default;
    };
    /// A state, from one place to another: part of a strip.
    struct Span {
        double from, to;
        std::string text;
        friend bool operator==(const Span&, const Span&) = default;
    };
    /// A moment at which something changed.
    struct Mark {
        double at;
        std::string text; ///< what it changed to; empty for a change of the serving cell
        friend bool operator==(const Mark&, const Mark&) = default;
    };
    /// The numbers from `least` up to the next band's, and their word.
    struct Band {
        double least;
        std::string word;
        friend bool operator==(const Band&, const Band&) = default;
    };

    std::vector<Point> points = {}; ///< of a number; at most 1,440
    std::vector<Span> spans = {};   ///< of a name, instead of points
    std::vector<Mark> marks = {};
    double bottom = 0, top = 1;             ///< the ends of the axis; points beyond them stand at the ends
    std::vector<Band> bands = {};           ///< the worst word first or last: in order of `least`
    std::vector<std::string> numbers = {};  ///< beside the axis: at its bottom, its middle and its top, with the unit
    std::vector<std::string> times = {};    ///< under it: at its left end, its middle and its right end
    std::vector<std::string> ranges = {};   ///< the times that the user may choose: "15 min", "1 h", "1 day"
    std::size_t range = 0;                  ///< the chosen one
    std::optional<std::size_t> cursor = {}; ///< a point, or a span; nothing: the newest
    std::string reading = {};               ///< moment and value at the cursor
    std::string sentence = {};              ///< the plot for a screen reader

    friend bool operator==(const SheetPlot&, const SheetPlot&) = default;
};

/// Lines of text, facts, a plot, and a table under them. Each may be missing.
struct SheetPart {
    std::string caption = {};
    std::vector<std::string> lines = {}; ///< each may be longer than the screen is wide
    std::vector<SheetFact> facts = {};
    std::optional<SheetPlot> plot = {};
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
    /// The user moved the plot's cursor to a point or a span; nothing: away.
    virtual void cursorMoved(std::optional<std::size_t> to) = 0;
    /// The user chose one of the plot's times.
    virtual void rangeChosen(std::size_t range) = 0;
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
