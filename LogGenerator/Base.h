#pragma once

#include "LogGenerator/ArrayLock.h"
#include "LogGenerator/Row.h"
#include "platform/Roles.h"
#include "platform/SystemLog.h"

#include <algorithm>
#include <concepts>
#include <cstdint>
#include <initializer_list>
#include <map>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

class Base;

/// Section name to section. The class index owns the sections.
using ClassDictionary = std::map<std::string, Base*, std::less<>>;
/// A log code's decimal text to the sections that subscribed to it, in the order in which they did.
using CodeDictionary = std::map<std::string, std::vector<Base*>, std::less<>>;

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

/// One record of a dictionary section: records of `code` shorter than `minimumLength` bytes (header included) are
/// dropped silently, longer ones shown by the rows.
struct Layout {
    LogCode code;
    std::size_t minimumLength;
    std::span<const Row> rows;
};

/// Whether the shortest record of each layout holds all of its fields.
constexpr bool rowsFit(std::span<const Layout> layouts)
{
    return std::ranges::all_of(layouts,
                               [](const Layout& layout) { return reach(layout.rows) <= layout.minimumLength; });
}

/// The codes of the layouts, then the others.
std::vector<LogCode> codesOf(std::span<const Layout> layouts, std::initializer_list<LogCode> others = {});

/// A section of the display: decodes records of the codes it names into its node.
///
/// It edits the node in place, so that the next refresh shows the change. A dictionary section sets keys; a key that
/// a record does not carry keeps its value. A list section rewrites its array.
class Base {
public:
    explicit Base(DecodingRoles& decodingRoles) : roles(decodingRoles) {}
    virtual ~Base() = default;
    Base(const Base&) = delete;
    Base& operator=(const Base&) = delete;

    /// Registers the section under its name and its codes. An operation, not the constructor: it calls what
    /// subclasses override.
    void initWithDict(ClassDictionary& classDict, CodeDictionary& codeDict);

    /// The key under which the section's node stands in the template.
    virtual std::string_view getSectionName() const = 0;
    /// The codes it decodes; none for a section that only shows what the template says.
    virtual std::vector<LogCode> getLogCodeArray() const = 0;
    /// Decodes one record, header included.
    virtual void updateWithData(Record data, LogCode logCode) = 0;

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
    /// The line that every call of `updateWithData` logs first: the section's name unless said otherwise.
    virtual std::string_view entryLine() const { return getSectionName(); }
    virtual Priority entryPriority() const { return Priority::Warning; }
    void logEntry() const;
    void logError(std::string_view text) const;

    /// "Received an unknown log message: %d"
    void reportUnknown(LogCode logCode) const;

    /// What a section with one code shares with all others: the entry line, and whether the record is of that code
    /// and long enough. A foreign code is reported, or ignored where the section says so.
    enum class Foreign { Reported, Ignored };
    bool accepts(Record data, LogCode logCode, LogCode expected, std::size_t minimumLength,
                 Foreign foreign = Foreign::Reported) const;

    /// Whether the record is at least that long; tells the watch, if there is one, when it is not.
    bool holds(Record data, std::size_t minimumLength) const;

    /// Shows the record by the layout of its code. False when no layout is of that code.
    bool publish(Record data, LogCode logCode, std::span<const Layout> layouts) const;
    /// Shows the rows in the section's dictionary.
    void publish(Record data, std::span<const Row> rows) const;
    /// Sets one key of the section's dictionary.
    void publish(std::string_view key, std::string_view text) const;
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
};

} // namespace kestrum
