#pragma once

#include "support/Bytes.h"
#include "support/Date.h"
#include "support/Reading.h"

#include <concepts>
#include <cstdint>
#include <functional>
#include <initializer_list>
#include <iosfwd>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

namespace kestrum {

class Array;
class Dictionary;

using ArrayRef = std::shared_ptr<Array>;
using DictionaryRef = std::shared_ptr<Dictionary>;

/// Under this key, a dictionary asks to be shown in the order of its keys; of "n;Name" only the name is shown.
inline constexpr char kSortedKey[] = "_sorted";

/// A node of the display, of a template, of the generator state or of a property list.
/// Arrays and dictionaries have identity: copies of the Value share the container. All else is a plain value.
class Value {
public:
    enum class Kind { Null, String, Integer, Real, Boolean, Date, Data, Array, Dictionary };

    Value() = default;
    Value(std::string text) : _held(std::move(text)) {}
    Value(std::string_view text) : _held(std::string(text)) {}
    Value(const char* text) : _held(std::string(text)) {}
    Value(ArrayRef array);                     ///< null for a null reference
    Value(DictionaryRef dictionary);           ///< null for a null reference
    Value(Reading reading) : _held(reading) {} ///< a string, whose text is made when it is read
    Value(Data data) : _held(std::move(data)) {}
    Value(Date date) : _held(date) {}
    Value(std::floating_point auto real) : _held(static_cast<double>(real)) {}
    Value(std::same_as<bool> auto boolean) : _held(boolean) {} // no conversions: a pointer is no boolean

    /// 64-bit integers, signed and unsigned told apart by what they hold: 2^64-1 is not -1.
    template <std::integral Number>
        requires(!std::same_as<Number, bool> && !std::same_as<Number, char>)
    Value(Number number)
    {
        if (std::is_unsigned_v<Number> && static_cast<std::uint64_t>(number) > std::uint64_t{INT64_MAX})
            _held = static_cast<std::uint64_t>(number);
        else
            _held = static_cast<std::int64_t>(number);
    }

    Kind kind() const;
    bool isNull() const { return kind() == Kind::Null; }
    bool isText() const { return kind() == Kind::String; }
    explicit operator bool() const { return !isNull(); }

    /// What the value holds when it is of that kind; else nothing (a null pointer, an empty optional).
    std::optional<std::string> text() const;              ///< of a string, readings included
    std::optional<Reading> reading() const;               ///< nothing for a plain string
    std::optional<std::int64_t> integer() const;          ///< nothing above 2^63-1 too
    std::optional<std::uint64_t> unsignedInteger() const; ///< nothing below 0
    std::optional<double> real() const;
    std::optional<bool> boolean() const;
    std::optional<Date> date() const;
    const Data* data() const { return std::get_if<Data>(&_held); }
    ArrayRef array() const;
    DictionaryRef dictionary() const;
    /// The same, borrowed from the value.
    const Dictionary* borrowedDictionary() const;
    const std::string* borrowedString() const { return std::get_if<std::string>(&_held); } ///< null for a reading

    /// A 32-bit number: an integer in range, or a real without fraction in range. A boolean is no number.
    std::optional<std::int32_t> int32() const;

    /// Makes this an empty container: the one it holds, started over, unless somebody else holds that too.
    Array& becomeArray();
    Dictionary& becomeDictionary();

    /// Forgets what it holds, but keeps the memory: a text or a container becomes empty (null when somebody else holds
    /// the container), all else null.
    void startOver();

    /// Makes this a string, reusing the storage of the one it holds.
    void assignText(std::string_view text);
    void assign(Reading reading)
    {
        if (auto* held = std::get_if<Reading>(&_held))
            *held = reading;
        else
            _held = reading;
    }

    /// Equal kind and contents: strings and readings by their texts, containers element by element (dictionaries
    /// without regard to order). Not for self-referring structures.
    friend bool operator==(const Value& left, const Value& right);
    friend bool operator==(const Value& value, std::string_view text) { return value.is(text); }
    friend bool operator==(const Value& value, const char* text) { return value.is(text); }
    /// Whether it is a string, a reading included, with this text.
    bool is(std::string_view text) const;

private:
    template <typename Container>
    Container& become();

    std::variant<std::monostate, std::string, Reading, std::int64_t, std::uint64_t, double, bool, Date, Data, ArrayRef,
                 DictionaryRef>
        _held;
};

/// The kind's name as it is put into messages: "string", "integer", ...
std::string_view nameOf(Value::Kind kind);

/// Values in order. `startOver` keeps the elements as spares, whose memory is used again: lists are rewritten thousands
/// of times a second, mostly with as much as before.
class Array {
public:
    Array() = default;
    Array(std::initializer_list<Value> elements) : _elements(elements), _size(elements.size()) {}
    explicit Array(std::vector<Value> elements) : _elements(std::move(elements)), _size(_elements.size()) {}
    Array(const Array&) = default; // and no move, which would leave a size without elements
    Array& operator=(const Array&) = default;

    std::size_t size() const { return _size; }
    bool empty() const { return _size == 0; }
    void clear()
    {
        _elements.clear();
        _size = 0;
    }
    void startOver() { _size = 0; } ///< empty, as after `clear`
    void dropSpares();
    void reserve(std::size_t count) { _elements.reserve(count); }
    /// Appends a null value, an empty text or an empty container, whichever stood there.
    Value& slot()
    {
        Value& value = reuse();
        value.startOver();
        return value;
    }
    void append(Value element) { reuse() = std::move(element); }
    void append(Reading reading) { reuse().assign(reading); }
    void appendText(std::string_view text) { reuse().assignText(text); }
    /// Appends a dictionary without entries.
    Dictionary& appendRow() { return reuse().becomeDictionary(); }
    /// `count` is not above `size()`.
    void removeFirst(std::size_t count)
    {
        _elements.erase(_elements.begin(), _elements.begin() + static_cast<std::ptrdiff_t>(count));
        _size -= count;
    }
    const Value& operator[](std::size_t index) const { return _elements[index]; }
    Value& operator[](std::size_t index) { return _elements[index]; }
    const Value& back() const { return _elements[_size - 1]; }

    auto begin() const { return _elements.begin(); }
    auto end() const { return _elements.begin() + static_cast<std::ptrdiff_t>(_size); }
    auto begin() { return _elements.begin(); }
    auto end() { return _elements.begin() + static_cast<std::ptrdiff_t>(_size); }

private:
    /// Appends a value that is to be set at once: a spare one, or null.
    Value& reuse()
    {
        if (_size == _elements.size())
            _elements.emplace_back();
        return _elements[_size++];
    }

    std::vector<Value> _elements; ///< the spares behind the others
    std::size_t _size = 0;
};

/// Values under string keys, in the order in which the keys first came. `startOver` keeps the entries as spares; keys
/// that come again in their order use their memory again.
class Dictionary {
public:
    struct Entry {
        std::string key;
        Value value;
    };

    Dictionary() = default;
    Dictionary(std::initializer_list<Entry> entries);
    Dictionary(const Dictionary&) = default; // and no move, which would leave a size without entries
    Dictionary& operator=(const Dictionary&) = default;

    std::size_t size() const { return _size; }
    bool empty() const { return _size == 0; }

    /// The value under `key`, null when there is none.
    const Value* find(std::string_view key) const { return valueAt(indexOf(key)); }
    Value* find(std::string_view key) { return const_cast<Value*>(valueAt(advanceTo(key))); }
    /// As `find`, as a value: the null value when there is none.
    Value at(std::string_view key) const;
    bool contains(std::string_view key) const { return find(key) != nullptr; }

    /// The value under `key`. A key that is not there is appended with a null value, an empty text or an empty
    /// container, whichever stood there.
    Value& slot(std::string_view key);
    /// Replaces the value under `key` in its place, or appends the key.
    void set(std::string_view key, Value value) { reuse(key) = std::move(value); }
    void set(std::string_view key, Reading reading) { reuse(key).assign(reading); }
    /// As `set`, without allocating when a text of that length stands there already.
    void setText(std::string_view key, std::string_view text) { reuse(key).assignText(text); }
    void remove(std::string_view key);
    void clear();
    void startOver() ///< empty, as after `clear`
    {
        _size = _next = 0;
        if (!_index.empty())
            _index.clear();
    }
    void dropSpares();

    auto begin() const { return _entries.begin(); }
    auto end() const { return _entries.begin() + static_cast<std::ptrdiff_t>(_size); }
    auto begin() { return _entries.begin(); }
    auto end() { return _entries.begin() + static_cast<std::ptrdiff_t>(_size); }

private:
    static constexpr std::size_t kNotThere = static_cast<std::size_t>(-1);

    // Below this many keys a look through them is faster than the index.
    static constexpr std::size_t kIndexFrom = 48;

    /// The value under `key`, which is to be set at once: that of a new key is a spare one, or null.
    Value& reuse(std::string_view key)
    {
        const auto expected = _entries.begin() + static_cast<std::ptrdiff_t>(_next);
        if (expected == _entries.end() || expected->key != key)
            return reuseElsewhere(key);
        if (_next++ == _size)
            takeSpare();
        return expected->value;
    }
    Value& reuseElsewhere(std::string_view key);
    const Value* valueAt(std::size_t index) const { return index == kNotThere ? nullptr : &_entries[index].value; }
    std::size_t indexOf(std::string_view key) const;
    std::size_t advanceTo(std::string_view key); ///< as `indexOf`; moves `_next` behind the entry
    void takeSpare()
    {
        if (++_size > kIndexFrom)
            index();
    }
    void index();

    std::vector<Entry> _entries; ///< the spares behind the others; no two keys are equal
    std::size_t _size = 0;
    // Decoders set their keys in the same order each time, or ask for the same one: the entry behind the last one
    // found is tried first, then that itself. Not above `_size`.
    std::size_t _next = 0;
    // Kept beyond a few dozen keys only: property lists from outside may hold many thousands. Sorted, for keys can be
    // chosen to collide in any hash.
    std::map<std::string, std::size_t, std::less<>> _index;
};

ArrayRef makeArray(std::vector<Value> elements = {});
DictionaryRef makeDictionary(std::initializer_list<Dictionary::Entry> entries = {});

/// A dictionary of the entries before the first null value: a null ends the list, whatever follows it.
DictionaryRef makeDictionaryUntilNull(std::initializer_list<Dictionary::Entry> entries);

/// A copy of the top-level container alone; its children are shared. Other values are copied as they are.
Value shallowCopy(const Value& value);
/// A copy that shares no container with the original (data bytes are shared: they cannot change).
/// Not for self-referring structures.
Value deepCopy(const Value& value);

/// One line: {"key": "text", "list": [1, 2.5, true, <3 bytes>]}. For logs and test messages.
std::string describe(const Value& value);
std::ostream& operator<<(std::ostream& out, const Value& value);
void PrintTo(const Value& value, std::ostream* out);

} // namespace kestrum
