#include "frontends/terminal/Box.h"

#include <algorithm>
#include <string>

namespace kestrum::terminal {

Area drawBox(Screen& screen, int rows, int columns)
{
    constexpr Style kFrame{.dim = true};
    rows = std::min(rows + 2, screen.rows());
    const int width = std::min(screen.columns(), kColumn);
    columns = std::min(columns + 4, width);
    const int top = (screen.rows() - rows) / 2, left = (width - columns) / 2;
    for (int row = 0; row < rows; ++row) {
        const Line line(screen, top + row, left, columns);
        const bool first = row == 0, last = row == rows - 1;
        line.fill();
        if (first || last)
            for (int column = 1; column < columns - 1; ++column)
                line.put(column, "─", kFrame);
        line.put(0, first ? "╭" : last ? "╰" : "│", kFrame);
        line.put(columns - 1, first ? "╮" : last ? "╯" : "│", kFrame);
    }
    return {top + 1, left + 2, std::max(0, rows - 2), std::max(0, columns - 4)};
}

} // namespace kestrum::terminal
