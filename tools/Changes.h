#pragma once

#include "support/Value.h"

#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// Tells which values of a display changed since it was last looked at. Walks it side by side with a copy of what it
/// saw, and builds no path but of what changed: it can look behind every message.
class Changes {
public:
    /// `path`: where the value stands in the display, as a JSON Pointer (RFC 6901): display names may be equal, keys
    /// are not. `value`: a leaf; null when there is none any more.
    using Tell = std::function<void(std::string_view path, const Value& value)>;

    explicit Changes(Tell tell) : _tell(std::move(tell)) {}

    void look(const Value& display) { compare(display, _seen); }

private:
    /// A step of the path: a key, or (without one) an index.
    struct Step {
        const std::string* key;
        std::size_t index;
    };

    void compare(const Value& now, Value& seen);
    void compare(const Dictionary& now, Dictionary& seen);
    void compare(const Array& now, Array& seen);
    void gone(const Value& seen);
    void tell(const Value& value);

    Tell _tell;
    Value _seen;
    std::vector<Step> _path;
    std::string _pointer;
};

} // namespace kestrum
