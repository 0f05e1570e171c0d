#pragma once

#include <stdexcept>
#include <string>
#include <utility>

namespace kestrum {

/// An internal inconsistency, with the place where it was found. `what()` contains all fields.
class AssertionFailure : public std::runtime_error {
public:
    /// `object` is the object or class whose operation found it. An empty `file` is reported as "<Unknown File>".
    AssertionFailure(const std::string& operation, const std::string& object, const std::string& file, int line,
                     std::string description);

    const std::string& file() const { return _file; }
    int line() const { return _line; }
    const std::string& description() const { return _description; }

private:
    std::string _file;
    int _line;
    std::string _description;
};

} // namespace kestrum
