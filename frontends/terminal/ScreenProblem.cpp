#include "frontends/terminal/Screen.h"

#include <cstdlib>
#include <unistd.h>

// Apart from the rest of Screen: the second header names macros like `columns`.
#include <curses.h>
#include <term.h>

namespace kestrum::terminal {

std::optional<std::string> Screen::problem()
{
    if (!isatty(STDIN_FILENO) || !isatty(STDOUT_FILENO))
        return "standard input and output are no terminal";
    const char* type = std::getenv("TERM");
    int error = 0;
    if (!type || !*type)
        return "TERM is not set, so the kind of terminal is not known";
    if (setupterm(type, STDOUT_FILENO, &error) != OK)
        return "the terminal \"" + std::string(type) + "\" is not known here; try TERM=vt100";
    const bool canMove = tigetstr("cup") != nullptr;
    del_curterm(cur_term);
    if (!canMove)
        return "the terminal \"" + std::string(type) + "\" cannot place its cursor";
    return std::nullopt;
}

} // namespace kestrum::terminal
