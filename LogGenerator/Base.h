#pragma once

#include "LogGenerator/ArrayLock.h"
#include "LogGenerator/Row.h"
#include "platform/Roles.h"
#include "platform/SystemLog.h"

#include <algorithm>
#include <concepts>
#include <cstdint>
#include <map>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace kestrum {

class Base;

/// Section name to section. The class index owns the sections.
using ClassDictionary = std::map<std::string, Base*, std::less<>>;
/// A log code to the sections that subscribed to it, in the order in which they did.
using CodeDictionary = std::unordered_map<LogCode, std::vector<Base*>>;

/// A section's node in the display: a dictionary or an array that the generator state owns. Harmless when it was
/// never set, is of the other shape, or is gone.
class SectionRef {
public:
    SectionRef() = default;
    explicit SectionRef(const Value& node) : _dictionary(node.dictionary()), _array(node.array()) {}

    /// Borrowed: the thread that decodes is the one that lets go of displays.
    Dictionary* dictionary() const { return _dictionary.borrowed(); }
    Array* array() const { return _array.borrowed(); }
    /// Shared; null when there is none.
    Value node() const
    {
        return _dictionary.borrowed() != nullptr ? Value(_dictionary.shared()) : Value(_array.shared());
    }

private:
    template <typename Container>
    class Watched {
    public:
        Watched() = default;
        explicit Watched(const std::shared_ptr<Container>& node) : _owner(node), _node(node.get()) {}

        Container* borrowed() const { return _owner.expired() ? nullptr : _node; }
        std::shared_ptr<Container> shared() const { return _owner.lock(); }

    private:
        std::weak_ptr<Container> _owner;
        Container* _node = nullptr;
    };

    Watched<Dictionary> _dictionary;
    Watched<Array> _array;
};

/// Elements inside a record, as many as a field of it says.
struct Repeated {
    Field count;
    Elements elements;
};

/// A record that a section takes. Without rows it is decoded by the section's own code.
struct Layout {
    LogCode code;
    std::size_t minimumLength = 0;     ///< in bytes, header included: a shorter record is dropped silently
    std::span<const Row> rows = {};    ///< of the section's dictionary, or of each element of its list
    std::optional<Repeated> list = {}; ///< where the section is a list: its elements
};

/// Whether the shortest record of each layout holds all of its fields, and each element all of its own.
constexpr bool fits(std::span<const Layout> layouts)
{
    return std::ranges::all_of(layouts, [](const Layout& layout) {
        if (layout.list)
            return layout.list->count.end() <= layout.minimumLength &&
                   reach(layout.rows) <= layout.list->elements.length;
        return reach(layout.rows) <= layout.minimumLength;
    });
}

/// What a section does with a record of a code that it does not list.
enum class ForeignCode { Reported, Ignored, Decoded };

/// What a section is, but for code of its own.
struct SectionTraits {
    std::string_view name;                ///< the key under which the section's node stands in the template
    std::span<const Layout> layouts = {}; ///< none for a section that only shows what the template says
    std::string_view entryLine = name;    ///< the line that each record logs first
    Priority entryPriority = Priority::Warning;
    ForeignCode foreignCode = ForeignCode::Reported;
};

/// A section of the display: decodes records of the codes it names into its node.
///
/// It edits the node in place, so that the next refresh shows the change. A dictionary section sets keys; a key that
/// a record does not carry keeps its value. A list section rewrites its array.
class Base {
public:
    /// `traits` is a constant: what it refers to outlives the section.
    Base(DecodingRoles& decodingRoles, const SectionTraits& traits) : roles(decodingRoles), _traits(traits) {}
    virtual ~Base() = default;
    Base(const Base&) = delete;
    Base& operator=(const Base&) = delete;

    /// Registers the section under its name and its codes.
    void initWithDict(ClassDictionary& classDict, CodeDictionary& codeDict);

    std::string_view getSectionName() const { return _traits.name; }
    /// The codes it decodes, in the order in which it registers them.
    std::vector<LogCode> getLogCodeArray() const;
    /// Decodes one record, header included: logs the entry line, leaves out foreign codes and short records.
    virtual void updateWithData(Record data, LogCode logCode);

    void updateSectionRef(const Value& node);
    void updateLogCodeDict(CodeDictionary& codeDict);

    /// Both under ArrayLock; nothing happens to a node that is no array.
    static void clearElementsInArray(const SectionRef& array);
    static void replaceArray(const SectionRef& array, std::vector<Value> With);
    /// The same, by what `append` appends. It is called without a node too: decoding may log.
    template <std::invocable<Array&> Append>
    static void replaceArray(const SectionRef& array, Append append)
    {
        auto* node = array.array();
        Array nowhere;
        Array& list = node != nullptr ? *node : nowhere;
        const auto locked = node != nullptr ? std::make_optional<ArrayLocked>() : std::nullopt;
        list.startOver();
        append(list);
    }

    /// The Ec/No in whole dB of a linear energy ratio, full scale 2^19. At or above full scale, and at or below 705,
    /// it is 0.
    static std::int16_t lookUpECNO(std::uint32_t linear);

protected:
    /// Shows a record that is long enough, by its layout. A section overrides it for what is particular to it.
    virtual void decode(Record data, const Layout& layout);

    void logError(std::string_view text) const;
    /// "Received an unknown log message: %d"
    void reportUnknown(LogCode logCode) const;

    /// Shows the rows in the section's dictionary.
    void publish(Record data, std::span<const Row> rows) const;
    /// Sets one key of the section's dictionary.
    void publish(std::string_view key, std::string_view text) const;
    void publish(std::string_view key, Reading reading) const;
    void publish(std::string_view key, Value value) const;
    void publish(std::string_view key, const char* text) const { publish(key, std::string_view(text)); }
    void publish(std::string_view key, const std::string& text) const { publish(key, std::string_view(text)); }
    /// Sets a list, which `append` fills.
    template <std::invocable<Array&> Append>
    void publish(std::string_view key, Append append) const
    {
        if (auto* node = sectionRef.dictionary())
            append(node->slot(key).becomeArray());
    }

    DecodingRoles& roles;
    SectionRef sectionRef;

private:
    const SectionTraits& _traits;
};

} // namespace kestrum
