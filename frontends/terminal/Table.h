#pragma once

#include "frontends/terminal/Cells.h"
#include "frontends/terminal/Repaint.h"
#include "frontends/terminal/Screen.h"
#include "platform/TableView.h"

#include <cstddef>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum::terminal {

/// A table with one row per line, one of them chosen.
class TerminalTable final : public TableView {
public:
    TerminalTable(TableDataSource& source, Repaint& repaint) : _source(source), _repaint(repaint) {}

    void reloadData() override;
    std::shared_ptr<ReusableCell> dequeueReusableCell(std::string_view reuseIdentifier) override;
    std::unique_ptr<TableCell> makeCell(CellStyle style) override;
    /// Kept chosen: without a chosen row the keyboard would have no position in the table.
    void deselectRow(IndexPath, bool) override {}
    void sizeToFit() override {} // it always has the screen's width

    /// Updates rows and cells for this area, and draws them.
    void draw(Screen& screen, Area area, bool focused);

    /// Handles a list's keys and mouse actions. False when the input is another one.
    bool handle(const Input& input);

    /// A row as users know it: its name, and its number among rows of the same name.
    struct Place {
        std::size_t row;
        std::string name;
    };

    /// Chooses the next row after `from` whose name contains `part`; continues at the top after the last row. False
    /// when there is none.
    bool choose(std::string_view part, std::size_t from);
    void choose(std::size_t row);
    std::size_t chosen() const;
    Place placeOf(std::size_t row);
    std::optional<std::size_t> find(const Place& place); ///< the nearest row of that name
    int chosenLine() const;                              ///< line of the screen, as drawn last
    std::size_t rows() const { return _rows; }
    std::string position() const; ///< "12/40" when some rows are out of sight

private:
    void load();
    std::shared_ptr<ReusableCell> cellFor(std::size_t row);
    void followChosen();
    void rememberChosen();
    std::string nameOf(std::size_t row);
    void move(std::ptrdiff_t rows);
    void scroll(std::ptrdiff_t rows);
    bool open(std::size_t row);
    std::size_t rowAt(const Input& mouse) const; ///< one past the last row when the mouse is on no row
    std::size_t top() const;
    std::size_t height() const { return static_cast<std::size_t>(_area.rows); }

    TableDataSource& _source;
    Repaint& _repaint;
    Area _area;
    std::size_t _rows = 0;
    // Set by the user. They are limited to the existing rows only at use, so that rows which come back restore them.
    std::size_t _chosen = 0, _top = 0;
    std::vector<Place> _heirs; // the chosen row, then its neighbours; after a reload the first remaining one is chosen
    std::optional<Place> _pressed;
    std::map<std::string, int> _sideways; // columns by which rows are scrolled, by name; without zeros
    bool _loaded = false, _chosenInSight = true;
    /// The rows in sight. A row keeps its cell, and no other row gets it: the cell of a row that opens cannot show a
    /// leaf's value.
    std::map<std::size_t, std::shared_ptr<ReusableCell>> _cells;
    std::shared_ptr<ReusableCell> _offered; // offered to the data source for the row that it is asked for
    std::shared_ptr<ReusableCell> _reader;  // a cell outside the table, used to read names
};

} // namespace kestrum::terminal
