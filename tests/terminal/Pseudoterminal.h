#pragma once

#include <functional>
#include <map>
#include <memory>
#include <string>
#include <string_view>
#include <sys/types.h>
#include <termios.h>
#include <vector>

struct VTerm;
struct VTermScreen;

namespace kestrum {

/// A program on a terminal of the test's own: what it writes goes through a real terminal's interpreter, and the test
/// sees the screen as a person would.
class Pseudoterminal {
public:
    Pseudoterminal(int rows, int columns);
    ~Pseudoterminal();
    Pseudoterminal(const Pseudoterminal&) = delete;
    Pseudoterminal& operator=(const Pseudoterminal&) = delete;

    /// Runs the program of that name in the build's bin directory. The environment is the test's, changed by these; an
    /// empty value takes the variable out.
    void start(const std::string& program, const std::vector<std::string>& arguments,
               const std::map<std::string, std::string>& environment);

    /// Takes in what the program writes until the condition holds. False when it does not within 20 s.
    bool waitUntil(const std::function<bool()>& condition);
    bool waitFor(std::string_view text);
    bool waitForEnd();
    bool waitForStop();
    /// Takes in all that the program has written by now.
    void takeInTheRest();

    std::string row(int row) const; ///< without trailing blanks
    std::string text() const;       ///< all rows, each with a newline
    bool shows(std::string_view text) const { return this->text().find(text) != std::string::npos; }
    int rowOf(std::string_view text) const; ///< -1 when no row shows it
    bool isReverse(int row, int column) const;
    bool isBold(int row, int column) const;
    bool isColoured(int row, int column) const;
    std::string chosen() const; ///< the row in reverse video
    bool onAlternateScreen() const { return _alternate; }
    bool cursorVisible() const { return _cursorVisible; }

    enum class Key {
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
        Backspace,
        Escape,
        Enter,
        Tab
    };
    void press(Key key);
    void type(std::string_view text);
    void click(int row, int column);
    void turnWheel(bool down);
    void resize(int rows, int columns);
    void signal(int number);
    void hangUp(); ///< the terminal is closed

    const std::string& written() const { return _written; } ///< everything the program has sent so far
    void forgetWritten() { _written.clear(); }
    termios modes() const;
    pid_t process() const { return _program; }
    int exitStatus() const; ///< as the shell counts it: 128 and the signal's number when one ended it

private:
    void takeIn(int milliseconds);
    void answer();
    void report(int button, int row, int column, char action);
    int rows() const;
    int columns() const;

    struct Callbacks;
    VTerm* _terminal;
    VTermScreen* _screen;
    int _master = -1, _slave = -1;
    pid_t _program = -1;
    int _status = 0;
    bool _ended = false, _stopped = false, _alternate = false, _cursorVisible = true;
    std::string _written;
};

} // namespace kestrum
