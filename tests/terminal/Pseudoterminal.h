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

/// A program on a separate terminal. Its output goes through a real terminal's interpreter, so the test sees the
/// screen as a user would.
class Pseudoterminal {
public:
    Pseudoterminal(int rows, int columns);
    ~Pseudoterminal();
    Pseudoterminal(const Pseudoterminal&) = delete;
    Pseudoterminal& operator=(const Pseudoterminal&) = delete;

    /// Runs the program of that name in the build's bin directory, with the test's environment and these changes. An
    /// empty value removes the variable.
    void start(const std::string& program, const std::vector<std::string>& arguments,
               const std::map<std::string, std::string>& environment);

    /// Reads the program's output until the condition is true. False when it is not within 20 s.
    bool waitUntil(const std::function<bool()>& condition);
    bool waitFor(std::string_view text);
    bool waitForEnd();
    bool waitForStop();
    /// Reads all output that the program has written so far.
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

    const std::string& written() const { return _written; } ///< everything that the program has written so far
    void forgetWritten() { _written.clear(); }
    termios modes() const;
    pid_t process() const { return _program; }
    int exitStatus() const; ///< as in a shell: 128 plus the signal's number when a signal ended it

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
