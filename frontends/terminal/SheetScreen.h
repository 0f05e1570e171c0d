#pragma once

#include "frontends/terminal/Repaint.h"
#include "frontends/terminal/Screen.h"
#include "platform/Sheet.h"

#include <cstddef>
#include <string>
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
    struct Piece {
        int column;
        std::string text;
        Style style;
    };
    /// A line of the sheet: pieces, or a line of a part's table.
    struct Row {
        enum class Kind { Pieces, Heading, Cells } kind;
        std::vector<Piece> pieces = {};
        std::size_t part = 0, row = 0;
    };
    /// The columns of a part's table, as wide as their contents.
    struct Widths {
        std::vector<int> values, words; // of each column
    };

    void layOut(int width, int height);
    void layOutParts(int width, bool spaced);
    void layOutFacts(const SheetPart& part, int width);
    void layOutTable(std::size_t index);
    void drawHeading(const Line& line, std::size_t part);
    void drawCells(const Line& line, std::size_t part, std::size_t row);
    void drawTitle(const Line& line) const;
    void drawBottom(const Line& line);
    template <typename Draw>
    void eachColumn(const Line& line, std::size_t part, Draw draw) const;
    void scroll(std::ptrdiff_t lines);
    void scrollSideways(int columns);
    void sortByNeighbour(int step);
    void press(const Input& input);
    std::size_t mostColumnsToSkip() const;

    SheetOwner& _owner;
    Repaint& _repaint;
    TerminalSheet*& _place;
    wchar_t _key;
    SheetContents _contents;
    std::vector<Row> _rows;
    std::vector<Widths> _widths;   // of each part
    int _width = -1, _height = -1; // of the screen, for which the rows are laid out
    std::size_t _first = 0;        // row at the top
    std::size_t _skipped = 0;      // columns that are scrolled out of sight at the left
    std::size_t _visible = 0;      // rows, as drawn last
    int _headingLine = -1, _bottom = 0, _back = 0;
    std::vector<int> _headings; // where the first table's columns begin, as drawn last; -1 out of sight
};

} // namespace kestrum::terminal
