#pragma once

#include "frontends/terminal/Screen.h"
#include "platform/Sheet.h"

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

/// Plots drawn with characters. A plot is decided here as cells; nothing depends on a clock or on the terminal.
namespace kestrum::terminal {

/// The characters of a curve.
enum class PlotMarks {
    Braille, ///< 2 x 4 dots in a character
    Blocks,  ///< the lower eighths of a character
    Ascii,
};

/// Braille, unless the terminal cannot be expected to have it. `asked` is the user's wish: "braille", "blocks" or
/// "ascii"; any other is none. A terminal without Unicode has ASCII only.
PlotMarks choosePlotMarks(Charset charset, std::string_view terminal, std::string_view asked);
/// The same for this process: TERM and KESTRUM_PLOT.
PlotMarks choosePlotMarks(Charset charset);

/// A text on a line of the screen.
struct Piece {
    int column;
    std::string text;
    Style style;
};
using Pieces = std::vector<Piece>;

/// The curve of a plot's points: `rows` lines of `columns` characters, the top first. Several points in one column make
/// a stroke from the least to the greatest; neighbours are joined, but never across a gap.
std::vector<std::wstring> curve(const SheetPlot& plot, PlotMarks marks, int columns, int rows);

/// The strip of a plot's spans: each begins with a bar and has its text, as far as there is room.
Pieces strip(const SheetPlot& plot, int columns);

/// A plot with all its texts.
struct PlotPicture {
    std::vector<Pieces> lines;
    Area cells;              ///< of the curve or the strip; row 0 is the first of `lines`
    std::vector<int> ranges; ///< where the texts of the ranges begin, on the first line
    int reading = -1;        ///< the line to be read aloud: of the cursor, else of the sentence; -1 for none
};

/// `columns` is the screen's width, `rows` the height of a curve.
PlotPicture draw(const SheetPlot& plot, PlotMarks marks, int columns, int rows);

/// The point or span under a column of the curve or strip. Nothing when there is none at all.
std::optional<std::size_t> pointAt(const SheetPlot& plot, int column, int columns);
/// The next one before or after the cursor that stands in another column; with 0 columns the very next one. Nothing
/// after the last.
std::optional<std::size_t> pointBeside(const SheetPlot& plot, bool isAfter, int columns);

} // namespace kestrum::terminal
