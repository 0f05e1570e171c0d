#pragma once

#include "LogGenerator/Base.h"
#include "support/Value.h"

#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace kestrum::tools {

/// Reports which values of a display have changed since the previous call. It compares the display with what it saw at
/// each place before. Both are walked in step, because they nearly always have the same keys in the same order.
class Changes {
public:
    struct Change {
        std::string_view path; ///< a JSON Pointer (RFC 6901): keys are unique, display names may be equal
        const Value& value;    ///< a leaf; null when it was removed
        std::string_view text; ///< the text of a string or a reading
        bool isPathPlain;      ///< all of the path is plain
    };
    /// Whether no format needs quotes or escapes for a text: printable ASCII without quotation mark, comma and backslash.
    static bool isPlain(std::string_view text);
    using OnChange = std::function<void(const Change&)>;
    /// The nodes of the display that a message of the code may change. Nothing when it may change any node.
    using NodesOf = std::function<std::optional<std::vector<Value>>(LogCode)>;

    explicit Changes(OnChange onChange) : _onChange(std::move(onChange)) {}

    /// Looks at the whole display.
    void look(const Value& display);
    /// Looks only at the nodes of the code, unless the display was replaced. `nodesOf` is called for a code's first
    /// message in each display.
    void look(const Value& display, LogCode code, const NodesOf& nodesOf);

private:
    /// What was seen at one place.
    struct Seen {
        enum class Form { Leaf, Dictionary, Array };

        std::string key = {};  ///< of a dictionary's entry
        std::string step = {}; ///< the last part of the path, with its "/"
        bool isPlain = true;   ///< the step
        Form form = Form::Leaf;
        Value leaf = {};            ///< null for a container; an empty text stands for each text that is no reading
        std::string text = {};      ///< of a leaf that has a text
        const void* node = nullptr; ///< the address of the container
        std::vector<std::shared_ptr<Seen>> children = {};
        std::size_t shown = 0; ///< children; those behind them are spares: lists shrink and grow again
    };
    struct Path {
        std::string text = {};
        bool isPlain = true;
    };
    /// Appends a step for a scope.
    class Step {
    public:
        Step(Path& path, const Seen& to) : _path(path), _length(path.text.size()), _wasPlain(path.isPlain)
        {
            _path.text += to.step;
            _path.isPlain = _wasPlain && to.isPlain;
        }
        ~Step()
        {
            _path.text.resize(_length);
            _path.isPlain = _wasPlain;
        }
        Step(const Step&) = delete;
        Step& operator=(const Step&) = delete;

    private:
        Path& _path;
        const std::size_t _length;
        const bool _wasPlain;
    };
    /// A section's place. The display and `_seen` own it.
    struct Part {
        Path around; ///< of the container around it
        std::weak_ptr<Seen> seen;
        SectionRef node;
    };

    void compare(const Value& now, Seen& seen);
    void compare(const Dictionary& now, Seen& seen);
    void compare(const Array& now, Seen& seen);
    void compareText(const Value& now, std::string_view text, Seen& seen);
    static std::shared_ptr<Seen> makeSeen(std::string_view key);
    void become(Seen::Form form, Seen& seen);
    void remove(Seen& seen);
    void removeFrom(std::size_t first, Seen& seen);
    void dropSpares();
    static void dropSparesOf(Seen& seen);
    void report(const Seen& seen, const Value& value, std::string_view text = {});

    bool lookAt(const std::vector<Part>& parts);
    void findParts(std::span<const Value> nodes, const std::shared_ptr<Seen>& below, std::vector<Part>& found);

    OnChange _onChange;
    std::shared_ptr<Seen> _seen = std::make_shared<Seen>();
    Path _path; ///< of the container that is walked

    std::size_t _spares = 0; ///< that were kept since they were dropped

    Value _display;                                        ///< held, so that no other display gets its address
    std::unordered_map<LogCode, std::vector<Part>> _parts; ///< by code
};

} // namespace kestrum::tools
