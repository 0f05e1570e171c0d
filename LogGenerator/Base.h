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
/// Log code to the sections that subscribe to it, in the order in which they subscribed.
using CodeDictionary = std::unordered_map<LogCode, std::vector<Base*>>;

/// A section's node in the display: a dictionary or an array that the state owns. Its accessors give null when the node
/// was never set, has the other kind, or was destroyed.
class SectionRef {
public:
    SectionRef() = default;
    explicit SectionRef(const Value& node) : _dictionary(node.dictionary()), _array(node.array()) {}

    /// Borrowed. Only the thread that decodes destroys displays, so the node stays valid during a call.
    Dictionary* dictionary() const { return _dictionary.borrowed(); }
    Array* array() const { return _array.borrowed(); }
    /// The node, shared; null when there is none.
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

/// Elements inside a record, and the field with their number.
struct Repeated {
    Field count;
    Elements elements;
};

/// The layout of one record of a section. Without rows the section overrides `decode`.
struct Layout {
    LogCode code;
    std::size_t minimumLength = 0;     ///< bytes, header included; a shorter record is dropped without a log line
    std::span<const Row> rows = {};    ///< rows of the section's dictionary, or of each element of its list
    std::optional<Repeated> list = {}; ///< the elements, when the section is a list
};

/// Whether the fields of each layout lie inside its shortest record, and an element's fields inside the element.
constexpr bool fits(std::span<const Layout> layouts)
{
    return std::ranges::all_of(layouts, [](const Layout& layout) {
        if (layout.list)
            return layout.list->count.end() <= layout.minimumLength &&
                   reach(layout.rows) <= layout.list->elements.length;
        return reach(layout.rows) <= layout.minimumLength;
    });
}

/// What a section does with a record whose code is in none of its layouts.
enum class ForeignCode { Reported, Ignored, Decoded };

/// The data of a section: constants from which Base does what all sections have in common.
struct SectionTraits {
    std::string_view name;                ///< the key of the section's node in the template
    std::span<const Layout> layouts = {}; ///< empty for a section that shows only the template's texts
    std::string_view entryLine = name;    ///< logged first for each record
    Priority entryPriority = Priority::Warning;
    ForeignCode foreignCode = ForeignCode::Reported;
};

/// A section of the display: decodes the records of its layouts into its node.
///
/// It edits the node in place; the next refresh shows the change. A dictionary section sets keys; a key whose field is
/// not in the record keeps its value. A list section replaces the contents of its array. Both store readings.
class Base {
public:
    /// `traits` is a constant, and so is everything that it refers to: both outlive the section.
    Base(DecodingRoles& decodingRoles, const SectionTraits& traits) : roles(decodingRoles), _traits(traits) {}
    virtual ~Base() = default;
    Base(const Base&) = delete;
    Base& operator=(const Base&) = delete;

    /// Registers the section under its name and its codes.
    void initWithDict(ClassDictionary& classDict, CodeDictionary& codeDict);

    std::string_view getSectionName() const { return _traits.name; }
    /// The codes of its layouts, in the order in which it registers them.
    std::vector<LogCode> getLogCodeArray() const;
    /// Decodes one record, header included. Logs the entry line; drops foreign codes and short records.
    virtual void updateWithData(Record data, LogCode logCode);

    void updateSectionRef(const Value& node);
    /// Its node in the display; null when it has none.
    Value node() const { return sectionRef.node(); }
    void updateLogCodeDict(CodeDictionary& codeDict);

    /// Empty or replace an array under ArrayLock. They do nothing when the node is no array.
    static void clearElementsInArray(const SectionRef& array);
    static void replaceArray(const SectionRef& array, std::vector<Value> With);
    /// Replaces the contents by the values that `append` appends. `append` runs also without a node: decoding may log.
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

    /// The Ec/No in whole dB (-31 to 0) of a linear energy ratio with full scale 2^19. 0 at or above full scale, and at
    /// or below 705.
    static std::int16_t lookUpECNO(std::uint32_t linear);

protected:
    /// Shows a record of sufficient length by its layout. A section overrides it for its particular code.
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
    /// Sets one key to a list that `append` fills.
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
