#pragma once

#include <stdexcept>
#include <string>
#include <string_view>

namespace kestrum {

/// The reader of our output has gone: nobody wants the rest.
struct ClosedPipe {};

/// What is decoded cannot be written.
class OutputFailure : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

/// Text on its way to a file descriptor, in large pieces. Throws ClosedPipe or
/// OutputFailure, unless a loss is to be ignored.
class OutputFile {
public:
    enum class Loss { Throws, Ignored };
    explicit OutputFile(int descriptor, Loss loss = Loss::Throws);

    /// What it was given by files and modems: harmless on a terminal, as it is elsewhere.
    void write(std::string_view text);
    /// What may move the cursor.
    void control(std::string_view text);
    void flush();

private:
    int _descriptor;
    Loss _loss;
    bool _isTerminal;
    std::string _held;
};

} // namespace kestrum
