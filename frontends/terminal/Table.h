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

/// Rows, one to a line, one of them chosen.
class TerminalTable final : public TableView {
public:
    TerminalTable(TableDataSource& source, Repaint& repaint) : _source(source), _repaint(repaint) {}

    void reloadData() override;
    std::shared_ptr<ReusableCell> dequeueReusableCell(std::string_view reuseIdentifier) override;
    std::unique_ptr<TableCell> makeCell(CellStyle style) override;
    /// The chosen row stays: without it the keyboard would have no place in the table.
    void deselectRow(IndexPath, bool) override {}
    void sizeToFit() override {} // it always has the screen's width

    /// Brings rows and cells up to date for this area, and shows them.
    void draw(Screen& screen, Area area, bool focused);

    /// The keys and the mouse of a list. False when the input is not for it.
    bool handle(const Input& input);

    /// A row as the user knows it: by its name, and among rows of one name by its number.
    struct Place {
        std::size_t row;
        std::string name;
    };

    /// Chooses the next row after `from`, round the end, in whose name `part` occurs. False when there is none.
    bool choose(std::string_view part, std::size_t from);
    void choose(std::size_t row);
    std::size_t chosen() const;
    Place placeOf(std::size_t row);
    std::optional<std::size_t> find(const Place& place); ///< the nearest row of that name
    int chosenLine() const;                              ///< on the screen, as last drawn
    std::size_t rows() const { return _rows; }
    std::string position() const; ///< "12/40" when not all rows are in sight

private:
    void load();
    std::shared_ptr<ReusableCell> cellFor(std::size_t row);
    void followChosen();
    void rememberChosen();
    std::string nameOf(std::size_t row);
    void move(std::ptrdiff_t rows);
    void scroll(std::ptrdiff_t rows);
    bool open(std::size_t row);
    std::size_t rowAt(const Input& mouse) const; ///< behind the last row where there is none
    std::size_t top() const;
    std::size_t height() const { return static_cast<std::size_t>(_area.rows); }

    TableDataSource& _source;
    Repaint& _repaint;
    Area _area;
    std::size_t _rows = 0;
    // Where the user put them. They are held to the rows that there are only when they are used, so that rows which come
    // back find them again.
    std::size_t _chosen = 0, _top = 0;
    std::vector<Place> _heirs; // the chosen row, and its neighbours: the first that a reload leaves is chosen then
    std::optional<Place> _pressed;
    std::map<std::string, int> _sideways; // how far rows are moved, by name; not those at rest
    bool _loaded = false, _chosenInSight = true;
    /// The rows in sight. A row keeps its cell, and no other row gets it: a leaf's value would be lost in the cell of a
    /// row that opens.
    std::map<std::size_t, std::shared_ptr<ReusableCell>> _cells;
    std::shared_ptr<ReusableCell> _offered; // to the data source, for the row it is asked for
    std::shared_ptr<ReusableCell> _reader;  // in no row: names are read with it
};

} // namespace kestrum::terminal
