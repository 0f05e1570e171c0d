#pragma once

#include <stdexcept>
#include <string>
#include <string_view>

namespace kestrum::tools {

/// The reader of our output has closed it: the rest is not wanted.
struct ClosedPipe {};

/// Standard output cannot be written.
class OutputFailure : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/// Text for a file descriptor, written in large pieces. Throws ClosedPipe or OutputFailure, unless losses are ignored.
class OutputFile {
public:
    enum class Loss { Throws, Ignored };
    explicit OutputFile(int descriptor, Loss loss = Loss::Throws);

    /// Text from files and modems: made harmless on a terminal, unchanged elsewhere.
    void write(std::string_view text);
    /// Our own text, which may move the cursor.
    void control(std::string_view text);
    void flush();

private:
    int _descriptor;
    Loss _loss;
    bool _isTerminal;
    std::string _held;
};

} // namespace kestrum::tools
