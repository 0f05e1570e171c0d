#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

/// Text for a terminal. Widths come from wcwidth(3), so the process needs a UTF-8 locale.
namespace kestrum::terminal {

/// The characters that the terminal can show.
enum class Charset { Unicode, Ascii };

/// Sets a UTF-8 locale for the process. Call it before Qt and the terminal library read the locale. Ascii where the
/// environment names a locale with another character set; Unicode where it names none, as in most containers.
Charset chooseLocale();

std::string utf8(std::wstring_view text);

/// One glyph of one or two columns: a character with its combining marks.
struct Glyph {
    std::wstring text;
    int columns;
};

/// Makes `text` safe for a terminal: nothing from outside can control it. Control characters become their pictures
/// (U+2400...). Invalid UTF-8, and characters without width or that change the writing direction, become U+FFFD. It
/// reads only as far as requested: a value can have megabytes, of which a screen shows a line.
class Glyphs {
public:
    explicit Glyphs(std::string_view text) : _text(text) {}

    std::optional<Glyph> next();               ///< empty at the end
    std::size_t read() const { return _read; } ///< bytes

private:
    wchar_t shownAt(std::size_t& at) const;

    std::string_view _text;
    std::size_t _read = 0;
};

/// The whole of `text` as one string.
std::string harmless(std::string_view text);

/// The number of columns that `text` takes.
int columns(std::string_view text);

/// The part of `text` that rows keep: all of it, or 16 KiB followed by "…", which is further than users scroll.
std::string beginning(std::string_view text);

/// `text` in at most `width` columns. A longer text loses its middle or its end ("…").
std::string cutInTheMiddle(std::string_view text, int width);
std::string cutAtTheEnd(std::string_view text, int width);

/// `text` in lines of at most `width` columns, broken at blanks, and inside words that are longer than a line.
std::vector<std::string> wrapped(std::string_view text, int width);

/// Whether `whole` contains `part`, ignoring case.
bool contains(std::string_view whole, std::string_view part);

} // namespace kestrum::terminal
