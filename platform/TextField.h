#pragma once

#include <optional>
#include <string>

namespace kestrum {

/// A single line that the user edits.
class TextField {
public:
    virtual ~TextField() = default;
    virtual std::optional<std::string> text() const = 0;
    virtual void resignFirstResponder() = 0; ///< closes the keyboard
};

} // namespace kestrum
