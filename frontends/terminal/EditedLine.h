#pragma once

#include "frontends/terminal/Screen.h"

#include <cstddef>
#include <string>

namespace kestrum::terminal {

/// One line of text under edit, with its cursor.
class EditedLine {
public:
    std::string text() const { return utf8(_text); }
    std::string beforeCursor() const { return utf8(std::wstring_view(_text).substr(0, _cursor)); }
    bool isEmpty() const { return _text.empty(); }

    /// Handles typed characters, and the keys that move and erase. False when the input is another one.
    bool handle(const Input& input);

private:
    bool handleCharacter(wchar_t character);
    std::size_t before() const; ///< where the character before the cursor begins, including its combining marks
    std::size_t after() const;
    void eraseTo(std::size_t place);

    std::wstring _text;
    std::size_t _cursor = 0;
};

} // namespace kestrum::terminal
