#pragma once

#include "frontends/terminal/CrashSignals.h"
#include "frontends/terminal/Text.h"
#include "support/Problem.h"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum::terminal {

/// Of the terminal's own palette.
enum class Colour { Plain, Accent, Danger };

struct Style {
    bool bold = false, dim = false, underlined = false, reverse = false;
    Colour colour = Colour::Plain;
};

/// Rows and bars keep to a column of at most this width: a value far from its key is hard to read.
inline constexpr int kColumn = 80;

/// A rectangle of the screen, in cells.
struct Area {
    int row = 0, column = 0, rows = 0, columns = 0;
    bool holds(int atRow, int atColumn) const
    {
        return atRow >= row && atRow < row + rows && atColumn >= column && atColumn < column + columns;
    }
};

enum class Key {
    Character,
    Up,
    Down,
    Left,
    Right,
    ShiftLeft,
    ShiftRight,
    Home,
    End,
    PageUp,
    PageDown,
    Enter,
    Escape,
    Tab,
    BackTab,
    Backspace,
    Delete,
    Press,
    Release,
    WheelUp,
    WheelDown,
    Other,
};

/// A key or a movement of the mouse.
struct Input {
    Key key;
    wchar_t character = 0;   ///< of Key::Character; below 32 with Ctrl
    int row = 0, column = 0; ///< of the mouse

    bool is(wchar_t c) const { return key == Key::Character && character == c; }
};

/// The terminal as a screen of cells. What is put on it becomes visible with `show`, which sends the difference to what
/// the terminal shows already, and nothing else.
class Screen {
public:
    explicit Screen(Charset charset) : _charset(charset) {}
    ~Screen();
    Screen(const Screen&) = delete;
    Screen& operator=(const Screen&) = delete;

    /// Why standard input and output cannot serve as a screen; nothing when they can.
    static std::optional<Problem> problem();

    void open();
    void close(); ///< The terminal is as it was before `open`.
    bool isOpen() const { return _open; }

    void suspend(); ///< gives the terminal to the shell
    void resume();  ///< takes it back, in whatever state it is
    void resize();  ///< follows the terminal's size

    int rows() const;
    int columns() const;

    void clear();
    void setDimmed(bool dimmed) { _dimmed = dimmed; } ///< What is put from now on is in the background.
    void put(int row, int column, const Glyph& glyph, Style style);
    void placeCursor(int row, int column, bool visible);
    void show();

    /// What was typed; nothing when all has been read.
    std::optional<Input> read();
    bool hungUp() const; ///< The terminal is gone.

private:
    Charset _charset;
    bool _open = false, _suspended = false, _coloured = false, _dimmed = false;
    struct {
        int row = 0, column = 0;
        bool visible = false;
    } _cursor;
    std::vector<Input> _mouse; // the last first
    int _standardError = -1;   // where it went before the screen was opened
    std::optional<CrashSignals> _crashSignals;
};

/// A stretch of one line of the screen. What does not lie in it is not shown.
class Line {
public:
    Line(Screen& screen, int row, int column, int columns)
        : _screen(screen), _row(row), _first(column), _end(column + columns), _origin(column)
    {}

    /// The stretch of `columns` from `column`, its content moved left by `scrolled`.
    Line part(int column, int columns, int scrolled = 0) const;
    /// The same with everything in reverse video, as the chosen row is shown.
    Line chosen() const;

    int width() const { return _end - _first; }
    int put(int column, std::string_view text,
            Style style = {}) const; ///< the column after the text, as far as it can be seen
    void putRight(std::string_view text, Style style = {}) const; ///< against the right edge
    void fill(Style style = {}) const;
    /// Marks the ends at which the content goes on.
    void markCut(bool left, bool right) const;

private:
    void put(int column, const Glyph& glyph, Style style) const;

    Screen& _screen;
    int _row, _first, _end, _origin;
    bool _chosen = false;
};

} // namespace kestrum::terminal
