#pragma once

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

/// Text as a terminal shows it. Widths come from wcwidth(3), so the process runs in a UTF-8 locale.
namespace kestrum::terminal {

/// What the terminal can show.
enum class Charset { Unicode, Ascii };

/// Sets a UTF-8 locale for the process, before Qt and the terminal library look at it. Ascii where the environment
/// names a locale with another character set; where it names none, as in most containers, Unicode is taken for granted.
Charset chooseLocale();

std::string utf8(std::wstring_view text);

/// What stands in one or two columns: a character with the marks combined with it.
struct Glyph {
    std::wstring text;
    int columns;
};

/// `text` as it may be sent to a terminal. Control characters are shown as their pictures (U+2400...), what is no UTF-8,
/// has no width or turns the direction of writing as U+FFFD: nothing from outside ever steers the terminal. Only what is
/// asked for is looked at: a value can have megabytes, of which a screen shows a line.
class Glyphs {
public:
    explicit Glyphs(std::string_view text) : _text(text) {}

    std::optional<Glyph> next();               ///< nothing at the end
    std::size_t read() const { return _read; } ///< bytes

private:
    wchar_t shownAt(std::size_t& at) const;

    std::string_view _text;
    std::size_t _read = 0;
};

/// The whole of it as one string.
std::string harmless(std::string_view text);

/// The columns that `text` takes.
int columns(std::string_view text);

/// What rows keep of `text`: all of it, or so much (16 KiB) that the rest ("…") lies beyond what anybody scrolls to.
std::string beginning(std::string_view text);

/// `text` in at most `width` columns, its middle or its end left out ("…") when it is longer.
std::string cutInTheMiddle(std::string_view text, int width);
std::string cutAtTheEnd(std::string_view text, int width);

/// The lines of `text`, broken so that each has at most `width` columns: at blanks, and within words that are longer.
std::vector<std::string> wrapped(std::string_view text, int width);

/// Whether `part` occurs in `whole`, upper and lower case alike.
bool contains(std::string_view whole, std::string_view part);

} // namespace kestrum::terminal
