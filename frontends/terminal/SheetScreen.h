#pragma once

#include "frontends/terminal/Plot.h"
#include "frontends/terminal/Repaint.h"
#include "frontends/terminal/Screen.h"
#include "platform/Sheet.h"

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum::terminal {

/// A sheet on the whole screen: its title, its parts one under the other, and its status.
class TerminalSheet final : public Sheet {
public:
    /// `place` refers to the sheet as long as it is open. `key` closes it, as Escape does.
    TerminalSheet(SheetOwner& owner, Repaint& repaint, TerminalSheet*& place, wchar_t key);
    ~TerminalSheet() override;
    TerminalSheet(const TerminalSheet&) = delete;
    TerminalSheet& operator=(const TerminalSheet&) = delete;

    void setContents(SheetContents contents) override;

    void draw(Screen& screen);
    /// May destroy the sheet.
    void handle(const Input& input);

private:
    /// A line of the sheet: pieces, or a line of a part's table.
    struct Row {
        enum class Kind { Pieces, Heading, Cells } kind;
        Pieces pieces = {};
        std::size_t part = 0, row = 0;
    };
    /// The columns of a part's table, as wide as their contents.
    struct Widths {
        std::vector<int> headings, values, words; // of each column; `values` holds the heading, too
    };
    /// A column in view: where it begins, and the columns of its values and of what stands beside them.
    struct Placed {
        std::size_t index;
        int at, value, beside;
    };

    void measureTables();
    void layOut(int width, int height, PlotMarks marks);
    void layOutParts(bool spaced, int plotRows);
    void layOutText(std::string_view text, int width, Style style);
    void layOutFacts(const SheetPart& part, int width, bool isBrief);
    void layOutPlot(const SheetPlot& plot, int rows);
    void layOutTable(std::size_t index);
    void drawHeading(const Line& line, std::size_t part);
    void drawCells(const Line& line, std::size_t part, std::size_t row);
    void drawTitle(const Line& line) const;
    void drawBottom(const Line& line);
    std::vector<Placed> placeColumns(std::size_t part, int width) const;
    void scroll(std::ptrdiff_t lines);
    void scrollSideways(int columns);
    void sortByNeighbour(int step);
    bool handlePlot(const Input& input);
    void press(const Input& input);
    bool pressPlot(const Input& input);
    int lineOf(int plotLine) const;
    const SheetPlot* plot() const; ///< the first one; null for none
    void rememberPlace();
    void returnToPlace();
    /// The row of a table that a line of the sheet shows; null for another line.
    const SheetRow* tableRow(const Row& row) const;
    std::size_t mostColumnsToSkip() const;

    SheetOwner& _owner;
    Repaint& _repaint;
    TerminalSheet*& _place;
    wchar_t _key;
    SheetContents _contents;
    std::vector<Row> _rows;
    std::vector<Widths> _widths;           // of each part
    int _width = -1, _height = -1;         // of the screen, for which the rows are laid out
    PlotMarks _marks = PlotMarks::Braille; // the same
    PlotPicture _picture;                  // of the first plot; its lines are among the rows
    std::size_t _plotRow = 0;              // where they begin
    struct Anchor {
        std::size_t part, line; // counted from the top
        std::string identity;
    };
    std::vector<std::vector<Placed>> _placed; // the columns in view of each part, as drawn last
    std::vector<Anchor> _anchors;             // rows that were in view before the contents changed
    std::size_t _first = 0;                   // row at the top
    std::size_t _skipped = 0;                 // columns that are scrolled out of sight at the left
    std::size_t _visible = 0;                 // rows, as drawn last
    int _headingLine = -1, _bottom = 0, _back = 0;
    std::vector<int> _headings; // where the first table's columns begin, as drawn last; -1 out of sight
};

} // namespace kestrum::terminal
