#pragma once

#include <stdexcept>
#include <string>
#include <string_view>

namespace kestrum::tools {

/// The reader has closed the pipe of our output and wants no more.
struct ClosedPipe {};

/// Standard output cannot be written.
class OutputFailure : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/// Buffered text for a file descriptor. Throws ClosedPipe or OutputFailure, unless losses are ignored.
class OutputFile {
public:
    enum class Loss { Throws, Ignored };
    explicit OutputFile(int descriptor, Loss loss = Loss::Throws);

    /// Writes text from files and modems: made harmless on a terminal, unchanged elsewhere.
    void write(std::string_view text);
    /// Writes our own text, which may contain control sequences.
    void control(std::string_view text);
    void flush();
    /// Writes to a temporary file from now on. Nothing is held.
    void redirect(int descriptor);

private:
    int _descriptor;
    Loss _loss;
    bool _isTerminal;
    const char* _name = "standard output";
    std::string _held;
};

} // namespace kestrum::tools
