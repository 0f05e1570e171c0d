#pragma once

#include "frontends/terminal/CrashSignals.h"
#include "frontends/terminal/Text.h"
#include "support/Problem.h"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum::terminal {

/// Colours of the terminal's palette.
enum class Colour { Plain, Accent, Danger };

struct Style {
    bool bold = false, dim = false, underlined = false, reverse = false;
    Colour colour = Colour::Plain;

    friend bool operator==(const Style&, const Style&) = default;
};

/// The maximum width of rows and bars: on a wider row the value is too far from its key to read them together.
inline constexpr int kColumn = 80;
/// Free columns on both sides of a row, and between two parts of it.
inline constexpr int kInset = 1, kGap = 2;
inline constexpr Style kDim{.dim = true};

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

/// The terminal as a screen of cells. `show` makes the contents visible: it sends only the difference to what the
/// terminal already shows.
class Screen {
public:
    explicit Screen(Charset charset) : _charset(charset) {}
    ~Screen();
    Screen(const Screen&) = delete;
    Screen& operator=(const Screen&) = delete;

    /// The reason why standard input and output cannot serve as a screen; empty when they can.
    static std::optional<Problem> problem();

    void open();
    void close(); ///< Restores the terminal to its state before `open`.
    bool isOpen() const { return _open; }

    void suspend(); ///< gives the terminal to the shell
    void resume();  ///< takes the terminal back, in whatever state it is
    void resize();  ///< follows the terminal's size

    int rows() const;
    int columns() const;
    Charset charset() const { return _charset; }

    void clear();
    void setDimmed(bool dimmed) { _dimmed = dimmed; } ///< Everything drawn from now on is dimmed.
    void put(int row, int column, const Glyph& glyph, Style style);
    void placeCursor(int row, int column, bool visible);
    void show();

    /// The next input; empty when all input was read.
    std::optional<Input> read();
    bool hungUp() const; ///< Whether the terminal is gone.

private:
    Charset _charset;
    bool _open = false, _suspended = false, _coloured = false, _dimmed = false;
    struct {
        int row = 0, column = 0;
        bool visible = false;
    } _cursor;
    std::vector<Input> _mouse; // in reverse order
    int _standardError = -1;   // the descriptor's target before the screen was opened
    std::optional<CrashSignals> _crashSignals;
};

/// A part of one line of the screen. Contents outside of it are not shown.
class Line {
public:
    Line(Screen& screen, int row, int column, int columns)
        : _screen(screen), _row(row), _first(column), _end(column + columns), _origin(column)
    {}

    /// The part of `columns` columns from `column`, its content scrolled left by `scrolled`.
    Line part(int column, int columns, int scrolled = 0) const;
    /// The same part in reverse video, for the chosen row.
    Line chosen() const;

    int width() const { return _end - _first; }
    int put(int column, std::string_view text,
            Style style = {}) const; ///< the column after the text, at most the end of the part
    void putRight(std::string_view text, Style style = {}) const; ///< aligned to the right edge
    void fill(Style style = {}) const;
    /// Marks the ends where content is hidden.
    void markCut(bool left, bool right) const;

private:
    void put(int column, const Glyph& glyph, Style style) const;

    Screen& _screen;
    int _row, _first, _end, _origin;
    bool _chosen = false;
};

} // namespace kestrum::terminal
