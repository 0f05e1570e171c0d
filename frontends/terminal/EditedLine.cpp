#include "frontends/terminal/EditedLine.h"

#include <algorithm>
#include <cwchar>
#include <utility>

namespace kestrum::terminal {

namespace {

constexpr wchar_t control(char letter)
{
    return letter & 0x1F;
}

} // namespace

bool EditedLine::handle(const Input& input)
{
    switch (input.key) {
    case Key::Character:
        return handleCharacter(input.character);
    case Key::Left:
        _cursor = before();
        return true;
    case Key::Right:
        _cursor = after();
        return true;
    case Key::Home:
        _cursor = 0;
        return true;
    case Key::End:
        _cursor = _text.size();
        return true;
    case Key::Backspace:
        eraseTo(before());
        return true;
    case Key::Delete:
        eraseTo(after());
        return true;
    default:
        return false;
    }
}

bool EditedLine::handleCharacter(wchar_t character)
{
    switch (character) {
    case control('A'):
        _cursor = 0;
        return true;
    case control('E'):
        _cursor = _text.size();
        return true;
    case control('K'):
        eraseTo(_text.size());
        return true;
    case control('U'):
        eraseTo(0);
        return true;
    case control('W'): {
        const auto last = _text.find_last_not_of(L' ', _cursor - std::min<std::size_t>(_cursor, 1));
        const auto blank = last == _text.npos ? last : _text.find_last_of(L' ', last);
        eraseTo(_cursor == 0 || blank == _text.npos ? 0 : blank + 1);
        return true;
    }
    default:
        if (wcwidth(character) < 0)
            return false;
        _text.insert(_cursor++, 1, character);
        return true;
    }
}

std::size_t EditedLine::before() const
{
    auto place = _cursor;
    while (place > 0 && wcwidth(_text[--place]) == 0) {
    }
    return place;
}

std::size_t EditedLine::after() const
{
    auto place = std::min(_cursor + 1, _text.size());
    while (place < _text.size() && wcwidth(_text[place]) == 0)
        ++place;
    return place;
}

void EditedLine::eraseTo(std::size_t place)
{
    const auto [first, end] = std::minmax(place, _cursor);
    _text.erase(first, end - first);
    _cursor = std::min(place, _cursor);
}

} // namespace kestrum::terminal
