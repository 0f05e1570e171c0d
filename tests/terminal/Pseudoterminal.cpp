#include "Pseudoterminal.h"
#include "harness/Places.h"

#include "support/Utf8.h"

#include <vterm.h>

#include <cerrno>
#include <chrono>
#include <csignal>
#include <cstdlib>
#include <fcntl.h>
#include <poll.h>
#include <pty.h>
#include <stdexcept>
#include <sys/ioctl.h>
#include <sys/wait.h>
#include <unistd.h>
#include <utmp.h>

namespace kestrum {

namespace {

constexpr std::chrono::seconds kPatience{20};

} // namespace

struct Pseudoterminal::Callbacks {
    static int property(VTermProp property, VTermValue* value, void* user)
    {
        auto& self = *static_cast<Pseudoterminal*>(user);
        if (property == VTERM_PROP_ALTSCREEN)
            self._alternate = value->boolean != 0;
        if (property == VTERM_PROP_CURSORVISIBLE)
            self._cursorVisible = value->boolean != 0;
        return 1;
    }
    // The library's versions differ in the other callbacks.
    static constexpr VTermScreenCallbacks kTable = [] {
        VTermScreenCallbacks table{};
        table.settermprop = property;
        return table;
    }();
};

Pseudoterminal::Pseudoterminal(int rows, int columns)
    : _terminal(vterm_new(rows, columns)), _screen(vterm_obtain_screen(_terminal))
{
    vterm_set_utf8(_terminal, 1);
    vterm_screen_set_callbacks(_screen, &Callbacks::kTable, this);
    vterm_screen_enable_altscreen(_screen, 1);
    vterm_screen_reset(_screen, 1);
    winsize size{};
    size.ws_row = static_cast<unsigned short>(rows);
    size.ws_col = static_cast<unsigned short>(columns);
    if (openpty(&_master, &_slave, nullptr, nullptr, &size) != 0)
        throw std::runtime_error("no pseudo-terminal");
    // Other programs that the test starts must not keep it open.
    for (const int each : {_master, _slave})
        fcntl(each, F_SETFD, FD_CLOEXEC);
}

Pseudoterminal::~Pseudoterminal()
{
    if (_program > 0 && !_ended) {
        kill(_program, SIGKILL);
        waitpid(_program, nullptr, 0);
    }
    hangUp();
    vterm_free(_terminal);
}

void Pseudoterminal::start(const std::string& program, const std::vector<std::string>& arguments,
                           const std::map<std::string, std::string>& environment)
{
    const std::string path = builtProgram(program);
    _program = fork();
    if (_program != 0)
        return;
    close(_master);
    login_tty(_slave);
    setenv("TERM", "xterm-256color", 1);
    for (const auto& [name, value] : environment)
        value.empty() ? unsetenv(name.c_str()) : setenv(name.c_str(), value.c_str(), 1);
    std::vector<char*> argv{const_cast<char*>(path.c_str())};
    for (const auto& each : arguments)
        argv.push_back(const_cast<char*>(each.c_str()));
    argv.push_back(nullptr);
    execv(path.c_str(), argv.data());
    _exit(127);
}

void Pseudoterminal::takeIn(int milliseconds)
{
    pollfd readable{_master, POLLIN, 0};
    if (_master < 0) {
        poll(nullptr, 0, milliseconds);
    } else if (poll(&readable, 1, milliseconds) > 0) {
        // In small pieces, so that a test without a needed wait fails every time, not once in a hundred times.
        char bytes[16];
        const auto length = read(_master, bytes, sizeof bytes);
        if (length > 0) {
            _written.append(bytes, static_cast<std::size_t>(length));
            vterm_input_write(_terminal, bytes, static_cast<std::size_t>(length));
            answer();
        }
    }
    int status = 0;
    if (!_ended && _program > 0 && waitpid(_program, &status, WNOHANG | WUNTRACED | WCONTINUED) == _program) {
        _stopped = WIFSTOPPED(status);
        _ended = WIFEXITED(status) || WIFSIGNALED(status);
        _status = status;
    }
}

// The terminal's own output, keys included.
void Pseudoterminal::answer()
{
    char bytes[256];
    for (std::size_t length; (length = vterm_output_read(_terminal, bytes, sizeof bytes)) > 0;)
        if (_master >= 0)
            type({bytes, length});
}

bool Pseudoterminal::waitUntil(const std::function<bool()>& condition)
{
    const auto deadline = std::chrono::steady_clock::now() + kPatience;
    while (!condition()) {
        if (std::chrono::steady_clock::now() > deadline)
            return false;
        takeIn(20);
    }
    return true;
}

bool Pseudoterminal::waitFor(std::string_view text)
{
    return waitUntil([&] { return shows(text); });
}

bool Pseudoterminal::waitForEnd()
{
    const bool ended = waitUntil([&] { return _ended; });
    takeInTheRest();
    return ended;
}

bool Pseudoterminal::waitForStop()
{
    const bool stopped = waitUntil([&] { return _stopped; });
    takeInTheRest();
    return stopped;
}

/// The last output of a program that writes no more may not have passed the terminal yet.
void Pseudoterminal::takeInTheRest()
{
    for (pollfd readable{_master, POLLIN, 0}; _master >= 0 && poll(&readable, 1, 0) > 0 && readable.revents & POLLIN;)
        takeIn(0);
}

int Pseudoterminal::rows() const
{
    int rows = 0, columns = 0;
    vterm_get_size(_terminal, &rows, &columns);
    return rows;
}

int Pseudoterminal::columns() const
{
    int rows = 0, columns = 0;
    vterm_get_size(_terminal, &rows, &columns);
    return columns;
}

std::string Pseudoterminal::row(int row) const
{
    std::string text;
    for (int column = 0; column < columns();) {
        VTermScreenCell cell{};
        vterm_screen_get_cell(_screen, {row, column}, &cell);
        if (cell.chars[0] == 0)
            text += ' ';
        for (int i = 0; i < VTERM_MAX_CHARS_PER_CELL && cell.chars[i] != 0; ++i)
            appendUtf8(text, cell.chars[i]);
        column += cell.width > 1 ? cell.width : 1;
    }
    text.resize(text.find_last_not_of(' ') + 1);
    return text;
}

std::string Pseudoterminal::text() const
{
    std::string text;
    for (int each = 0; each < rows(); ++each)
        text += row(each) + "\n";
    return text;
}

int Pseudoterminal::rowOf(std::string_view text) const
{
    for (int each = 0; each < rows(); ++each)
        if (row(each).find(text) != std::string::npos)
            return each;
    return -1;
}

bool Pseudoterminal::isReverse(int row, int column) const
{
    VTermScreenCell cell{};
    vterm_screen_get_cell(_screen, {row, column}, &cell);
    return cell.attrs.reverse != 0;
}

bool Pseudoterminal::isBold(int row, int column) const
{
    VTermScreenCell cell{};
    vterm_screen_get_cell(_screen, {row, column}, &cell);
    return cell.attrs.bold != 0;
}

bool Pseudoterminal::isColoured(int row, int column) const
{
    VTermScreenCell cell{};
    vterm_screen_get_cell(_screen, {row, column}, &cell);
    return !VTERM_COLOR_IS_DEFAULT_FG(&cell.fg);
}

std::string Pseudoterminal::chosen() const
{
    for (int each = 0; each < rows(); ++each)
        if (isReverse(each, 0))
            return row(each);
    return {};
}

void Pseudoterminal::press(Key key)
{
    const auto send = [&](VTermKey code, VTermModifier modifier = VTERM_MOD_NONE) {
        vterm_keyboard_key(_terminal, code, modifier);
    };
    switch (key) {
    case Key::Up:
        send(VTERM_KEY_UP);
        break;
    case Key::Down:
        send(VTERM_KEY_DOWN);
        break;
    case Key::Left:
        send(VTERM_KEY_LEFT);
        break;
    case Key::Right:
        send(VTERM_KEY_RIGHT);
        break;
    case Key::ShiftLeft:
        send(VTERM_KEY_LEFT, VTERM_MOD_SHIFT);
        break;
    case Key::ShiftRight:
        send(VTERM_KEY_RIGHT, VTERM_MOD_SHIFT);
        break;
    case Key::Home:
        send(VTERM_KEY_HOME);
        break;
    case Key::End:
        send(VTERM_KEY_END);
        break;
    case Key::PageUp:
        send(VTERM_KEY_PAGEUP);
        break;
    case Key::PageDown:
        send(VTERM_KEY_PAGEDOWN);
        break;
    case Key::Backspace:
        send(VTERM_KEY_BACKSPACE);
        break;
    case Key::Escape:
        send(VTERM_KEY_ESCAPE);
        break;
    case Key::Enter:
        send(VTERM_KEY_ENTER);
        break;
    case Key::Tab:
        send(VTERM_KEY_TAB);
        break;
    }
    answer();
}

void Pseudoterminal::type(std::string_view text)
{
    while (!text.empty()) {
        const auto written = write(_master, text.data(), text.size());
        if (written < 0)
            throw std::runtime_error("the terminal takes no input");
        text.remove_prefix(static_cast<std::size_t>(written));
    }
}

// The interpreter does not recognise the program's request for mouse reports, which comes together with the request
// for their format (xterm's SGR). So the reports are written here.
void Pseudoterminal::report(int button, int row, int column, char action)
{
    type("\x1B[<" + std::to_string(button) + ";" + std::to_string(column + 1) + ";" + std::to_string(row + 1) + action);
}

void Pseudoterminal::click(int row, int column)
{
    report(0, row, column, 'M');
    report(0, row, column, 'm');
}

void Pseudoterminal::turnWheel(bool down)
{
    report(down ? 65 : 64, 1, 1, 'M');
}

void Pseudoterminal::resize(int rows, int columns)
{
    vterm_set_size(_terminal, rows, columns);
    winsize size{};
    size.ws_row = static_cast<unsigned short>(rows);
    size.ws_col = static_cast<unsigned short>(columns);
    ioctl(_master, TIOCSWINSZ, &size); // the kernel tells the program
}

void Pseudoterminal::signal(int number)
{
    kill(_program, number);
}

void Pseudoterminal::hangUp()
{
    if (_master >= 0)
        close(_master);
    if (_slave >= 0)
        close(_slave);
    _master = _slave = -1;
}

termios Pseudoterminal::modes() const
{
    termios modes{};
    tcgetattr(_slave, &modes);
    return modes;
}

int Pseudoterminal::exitStatus() const
{
    return WIFSIGNALED(_status) ? 128 + WTERMSIG(_status) : WEXITSTATUS(_status);
}

} // namespace kestrum
