#pragma once

#include "support/Value.h"

#include <functional>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum::tools {

/// Reports which values of a display have changed since the previous call. It compares the display with a copy of the
/// previous one, and builds paths only for changes. So it is fast enough to run after every message.
class Changes {
public:
    /// `path`: the value's place in the display, as a JSON Pointer (RFC 6901). Keys are unique; display names may be
    /// equal. `value`: a leaf; null when it was removed.
    using OnChange = std::function<void(std::string_view path, const Value& value)>;

    explicit Changes(OnChange onChange) : _onChange(std::move(onChange)) {}

    void look(const Value& display) { compare(display, _seen); }

private:
    /// A step of the path: a key, or an index if there is no key.
    struct Step {
        const std::string* key;
        std::size_t index;
    };

    void compare(const Value& now, Value& seen);
    void compare(const Dictionary& now, Dictionary& seen);
    void compare(const Array& now, Array& seen);
    void removed(const Value& seen);
    void report(const Value& value);

    OnChange _onChange;
    Value _seen;
    std::vector<Step> _path;
    std::string _pointer;
};

} // namespace kestrum::tools
