#include "frontends/terminal/Screen.h"

#define NCURSES_NOMACROS // without it `clear`, `move` and `timeout` would be macros
#include <curses.h>

#include <algorithm>
#include <cstdlib>
#include <fcntl.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <unistd.h>

namespace kestrum::terminal {

namespace {

constexpr int kEscapeDelay = 25; // ms; the rest of a key's sequence must follow its ESC within this time

// The replacement of the program's marks on a terminal without Unicode; '?' for all other characters.
wchar_t asciiFor(wchar_t c)
{
    constexpr std::wstring_view kMarks = L"›…✓─│╭╮╰╯⠋⠙⠹⠸⠼⠴⠦⠧⠇⠏↑↓·█▉▊▋▌▍▎▏",
                                kAscii = L">~*-|++++|/-\\|/-\\|/^v.#####---";
    static_assert(kMarks.size() == kAscii.size());
    const auto found = kMarks.find(c);
    return found == kMarks.npos ? L'?' : kAscii[found];
}

bool wantsColour()
{
    const char* refused = std::getenv("NO_COLOR");
    return has_colors() && !(refused && *refused);
}

Key keyOf(wint_t code)
{
    switch (code) {
    case KEY_UP:
        return Key::Up;
    case KEY_DOWN:
        return Key::Down;
    case KEY_LEFT:
        return Key::Left;
    case KEY_RIGHT:
        return Key::Right;
    case KEY_SLEFT:
        return Key::ShiftLeft;
    case KEY_SRIGHT:
        return Key::ShiftRight;
    case KEY_HOME:
        return Key::Home;
    case KEY_END:
        return Key::End;
    case KEY_PPAGE:
        return Key::PageUp;
    case KEY_NPAGE:
        return Key::PageDown;
    case KEY_ENTER:
        return Key::Enter;
    case KEY_BACKSPACE:
        return Key::Backspace;
    case KEY_DC:
        return Key::Delete;
    case KEY_BTAB:
        return Key::BackTab;
    default:
        return Key::Other;
    }
}

Key keyOfCharacter(wint_t character)
{
    switch (character) {
    case '\r':
    case '\n':
        return Key::Enter;
    case '\t':
        return Key::Tab;
    case 27:
        return Key::Escape;
    case 8:
    case 127:
        return Key::Backspace;
    default:
        return Key::Character;
    }
}

Input inputOf(const MEVENT& event)
{
    const auto has = [&](mmask_t buttons) { return (event.bstate & buttons) != 0; };
    const Key key = has(BUTTON4_PRESSED)    ? Key::WheelUp
                    : has(BUTTON5_PRESSED)  ? Key::WheelDown
                    : has(BUTTON1_PRESSED)  ? Key::Press
                    : has(BUTTON1_RELEASED) ? Key::Release
                                            : Key::Other;
    return {key, 0, event.y, event.x};
}

} // namespace

Screen::~Screen()
{
    close();
}

void Screen::open()
{
    if (_open)
        return;
    // Messages of libraries on standard error would overwrite the rows.
    if (isatty(STDERR_FILENO)) {
        _standardError = fcntl(STDERR_FILENO, F_DUPFD_CLOEXEC, STDERR_FILENO + 1);
        const int nowhere = ::open("/dev/null", O_WRONLY | O_CLOEXEC);
        dup2(nowhere, STDERR_FILENO);
        ::close(nowhere);
    }
    termios before{};
    tcgetattr(STDOUT_FILENO, &before);
    initscr();
    cbreak();
    noecho();
    nonl();
    intrflush(nullptr, FALSE);
    keypad(stdscr, TRUE);
    nodelay(stdscr, TRUE);
    set_escdelay(kEscapeDelay);
    curs_set(0);
    _coloured = wantsColour() && start_color() == OK && use_default_colors() == OK;
    if (_coloured) {
        init_pair(static_cast<short>(Colour::Accent), COLOR_CYAN, -1);
        init_pair(static_cast<short>(Colour::Danger), COLOR_RED, -1);
    }
    // A press counts at once: a wait for a double click would delay it.
    mouseinterval(0);
    mousemask(BUTTON1_PRESSED | BUTTON1_RELEASED | BUTTON4_PRESSED | BUTTON5_PRESSED, nullptr);
    _crashSignals.emplace(before);
    _open = true;
}

void Screen::close()
{
    if (!_open)
        return;
    if (!_suspended)
        endwin();
    _crashSignals.reset();
    _open = false;
    if (_standardError >= 0) {
        dup2(_standardError, STDERR_FILENO);
        ::close(_standardError);
        _standardError = -1;
    }
}

void Screen::suspend()
{
    if (_open && !_suspended)
        endwin();
    _suspended = true;
}

void Screen::resume()
{
    _suspended = false;
    if (!_open)
        return;
    // If the stop left no time to hand over the terminal, the shell has changed its modes nevertheless.
    if (!isendwin())
        endwin();
    resize();
}

void Screen::resize()
{
    winsize size{};
    if (_open && ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_row > 0 && size.ws_col > 0)
        resizeterm(size.ws_row, size.ws_col);
}

int Screen::rows() const
{
    winsize size{};
    if (_open)
        return getmaxy(stdscr);
    return ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_row > 0 ? size.ws_row : 24;
}

int Screen::columns() const
{
    winsize size{};
    if (_open)
        return getmaxx(stdscr);
    return ioctl(STDOUT_FILENO, TIOCGWINSZ, &size) == 0 && size.ws_col > 0 ? size.ws_col : 80;
}

void Screen::clear()
{
    werase(stdscr);
    _dimmed = false;
}

void Screen::put(int row, int column, const Glyph& glyph, Style style)
{
    if (row < 0 || row >= rows() || column < 0 || column + glyph.columns > columns())
        return;
    attr_t attributes = A_NORMAL;
    short pair = _coloured ? static_cast<short>(style.colour) : short{0};
    if (_dimmed) {
        attributes = A_DIM;
        pair = 0;
    } else {
        attributes |= style.bold ? A_BOLD : 0;
        attributes |= style.dim ? A_DIM : 0;
        attributes |= style.reverse ? A_REVERSE : 0;
    }
    attributes |= style.underlined ? A_UNDERLINE : 0;

    const auto set = [&](int at, const std::wstring& text) {
        cchar_t cell;
        if (setcchar(&cell, text.c_str(), attributes, pair, nullptr) == OK)
            mvwadd_wchnstr(stdscr, row, at, &cell, 1);
    };
    if (_charset == Charset::Unicode || glyph.text[0] <= 0x7E)
        set(column, glyph.text);
    else
        for (int each = 0; each < glyph.columns; ++each)
            set(column + each, {asciiFor(glyph.text[0])});
}

void Screen::placeCursor(int row, int column, bool visible)
{
    // Screen readers and braille lines follow the cursor, even the hidden one.
    _cursor = {row, column, visible};
}

void Screen::show()
{
    if (!_open || _suspended)
        return;
    curs_set(_cursor.visible ? 1 : 0);
    wmove(stdscr, std::clamp(_cursor.row, 0, rows() - 1), std::clamp(_cursor.column, 0, columns() - 1));
    wrefresh(stdscr);
}

std::optional<Input> Screen::read()
{
    if (!_open || _suspended)
        return std::nullopt;
    if (!_mouse.empty()) {
        const Input input = _mouse.back();
        _mouse.pop_back();
        return input;
    }
    wint_t code = 0;
    switch (wget_wch(stdscr, &code)) {
    case OK:
        if (code == ('L' & 0x1F))
            clearok(curscr, TRUE); // Ctrl-L: removes what another program wrote to the screen
        return Input{keyOfCharacter(code), static_cast<wchar_t>(code)};
    case KEY_CODE_YES:
        if (code != KEY_MOUSE)
            return Input{keyOf(code)};
        // One key can carry several mouse events, the last one first.
        for (MEVENT event; getmouse(&event) == OK;)
            _mouse.push_back(inputOf(event));
        return _mouse.empty() ? Input{Key::Other} : read();
    default:
        return std::nullopt;
    }
}

bool Screen::hungUp() const
{
    pollfd terminal{STDIN_FILENO, POLLIN, 0};
    return poll(&terminal, 1, 0) > 0 && (terminal.revents & (POLLHUP | POLLERR | POLLNVAL)) != 0;
}

Line Line::part(int column, int columns, int scrolled) const
{
    Line part = *this;
    part._first = std::clamp(_origin + column, _first, _end);
    part._end = std::clamp(_origin + column + columns, part._first, _end);
    part._origin = _origin + column - scrolled;
    return part;
}

Line Line::chosen() const
{
    Line line = *this;
    line._chosen = true;
    return line;
}

void Line::put(int column, const Glyph& glyph, Style style) const
{
    if (_chosen)
        style = {.bold = style.bold, .reverse = true};
    if (column >= _first && column + glyph.columns <= _end)
        _screen.put(_row, column, glyph, style);
    else // the second half of a wide character
        for (int each = std::max(column, _first); each < std::min(column + glyph.columns, _end); ++each)
            _screen.put(_row, each, {L" ", 1}, style);
}

int Line::put(int column, std::string_view text, Style style) const
{
    Glyphs glyphs(text);
    while (_origin + column <= _end) {
        const auto each = glyphs.next();
        if (!each)
            break;
        put(_origin + column, *each, style);
        column += each->columns;
    }
    return column;
}

void Line::putRight(std::string_view text, Style style) const
{
    put(_end - _origin - terminal::columns(text), text, style);
}

void Line::fill(Style style) const
{
    for (int column = _first; column < _end; ++column)
        put(column, {L" ", 1}, style);
}

void Line::markCut(bool left, bool right) const
{
    if (left)
        put(_first, {L"…", 1}, {.colour = Colour::Accent});
    if (right)
        put(_end - 1, {L"…", 1}, {.colour = Colour::Accent});
}

} // namespace kestrum::terminal
