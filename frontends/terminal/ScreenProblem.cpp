#include "frontends/terminal/Screen.h"

#include <cstdlib>
#include <unistd.h>

// Separate from Screen.cpp, because term.h defines macros like `columns`.
#include <curses.h>
#include <term.h>

namespace kestrum::terminal {

std::optional<Problem> Screen::problem()
{
    if (!isatty(STDIN_FILENO) || !isatty(STDOUT_FILENO))
        return Problem{"standard input and output are not a terminal"};
    const char* type = std::getenv("TERM");
    int error = 0;
    if (!type || !*type)
        return Problem{"TERM is not set, so the type of the terminal is unknown"};
    if (setupterm(type, STDOUT_FILENO, &error) != OK)
        return Problem{"the terminal \"" + std::string(type) + "\" is unknown on this system; try TERM=vt100"};
    const bool canMove = tigetstr("cup") != nullptr;
    del_curterm(cur_term);
    if (!canMove)
        return Problem{"the terminal \"" + std::string(type) + "\" cannot place its cursor"};
    return std::nullopt;
}

} // namespace kestrum::terminal
