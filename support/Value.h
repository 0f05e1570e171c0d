#pragma once

#include "support/Bytes.h"
#include "support/Date.h"
#include "support/Reading.h"

#include <concepts>
#include <cstdint>
#include <cstring>
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

/// `left == right`, by words and without a call: keys are short, and each field of a record finds its key so.
inline bool isSameKey(std::string_view left, std::string_view right)
{
    using Word = std::uint64_t;
    if (left.size() != right.size() || left.size() < sizeof(Word))
        return left == right;
    const auto isSameAt = [&](std::size_t at) {
        Word a, b;
        std::memcpy(&a, left.data() + at, sizeof a);
        std::memcpy(&b, right.data() + at, sizeof b);
        return a == b;
    };
    const std::size_t last = left.size() - sizeof(Word);
    for (std::size_t at = 0; at < last; at += sizeof(Word))
        if (!isSameAt(at))
            return false;
    return isSameAt(last);
}

using ArrayRef = std::shared_ptr<Array>;
using DictionaryRef = std::shared_ptr<Dictionary>;

/// A dictionary with this key is shown in the order of its keys; of a key "n;Name" only the name is shown.
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
    Value(Reading reading) : _held(reading) {} ///< a string; its text is made when it is read
    Value(Data data) : _held(std::move(data)) {}
    Value(Date date) : _held(date) {}
    Value(std::floating_point auto real) : _held(static_cast<double>(real)) {}
    Value(std::same_as<bool> auto boolean) : _held(boolean) {} // no conversions: a pointer is no boolean

    /// An integer from -2^63 to 2^64-1. Signed and unsigned integers are equal when their numbers are.
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
    bool isNull() const { return std::holds_alternative<std::monostate>(_held); }
    bool isText() const { return kind() == Kind::String; }
    explicit operator bool() const { return !isNull(); }

    /// The contents when the value has that kind; else nothing (a null pointer, an empty optional).
    std::optional<std::string> text() const;              ///< of a string or a reading
    std::optional<Reading> reading() const;               ///< nothing for a plain string
    std::optional<std::int64_t> integer() const;          ///< nothing above 2^63-1
    std::optional<std::uint64_t> unsignedInteger() const; ///< nothing below 0
    std::optional<double> real() const;
    std::optional<bool> boolean() const;
    std::optional<Date> date() const;
    const Data* data() const { return std::get_if<Data>(&_held); }
    ArrayRef array() const;
    DictionaryRef dictionary() const;
    /// Borrowed: valid until the value changes.
    Dictionary* borrowedDictionary() const { return borrowed<DictionaryRef>(); }
    Array* borrowedArray() const { return borrowed<ArrayRef>(); }
    const Reading* borrowedReading() const { return std::get_if<Reading>(&_held); }
    const std::string* borrowedString() const { return std::get_if<std::string>(&_held); } ///< null for a reading

    /// A 32-bit number: an integer in range, or a real in range without a fraction. Nothing for a boolean.
    std::optional<std::int32_t> int32() const;

    /// Makes this an empty container. Reuses the container it holds when no other value shares it.
    Array& becomeArray();
    Dictionary& becomeDictionary();

    /// Empties a text or a container and keeps its memory for reuse. A shared container and any other kind become null.
    void startOver();

    /// Makes this a string. Reuses the memory of the string it holds.
    void assignText(std::string_view text);
    void assign(Reading reading)
    {
        if (auto* held = std::get_if<Reading>(&_held))
            *held = reading;
        else
            _held = reading;
    }

    /// Same kind and equal contents: strings and readings by text, containers element by element (dictionaries in any
    /// order). Recursive: a container must not contain itself.
    friend bool operator==(const Value& left, const Value& right);
    friend bool operator==(const Value& value, std::string_view text) { return value.is(text); }
    friend bool operator==(const Value& value, const char* text) { return value.is(text); }
    /// Whether it is a string or a reading with this text.
    bool is(std::string_view text) const;

private:
    template <typename Container>
    Container& become();
    template <typename Reference>
    typename Reference::element_type* borrowed() const
    {
        const auto* held = std::get_if<Reference>(&_held);
        return held != nullptr ? held->get() : nullptr;
    }

    std::variant<std::monostate, std::string, Reading, std::int64_t, std::uint64_t, double, bool, Date, Data, ArrayRef,
                 DictionaryRef>
        _held;
};

/// The kind's name for messages: "string", "integer", ...
std::string_view nameOf(Value::Kind kind);

/// Values in order. `startOver` empties the array but keeps the elements as spares, whose memory the next elements
/// reuse: lists are rewritten thousands of times a second with about the same contents. Without it an LTE stream would
/// take six allocations a message instead of none, and two thirds more time.
class Array {
public:
    Array() = default;
    Array(std::initializer_list<Value> elements) : _elements(elements), _size(elements.size()) {}
    explicit Array(std::vector<Value> elements) : _elements(std::move(elements)), _size(_elements.size()) {}
    Array(const Array&) = default; // no move: the source would keep its size but lose its elements
    Array& operator=(const Array&) = default;

    std::size_t size() const { return _size; }
    bool empty() const { return _size == 0; }
    void clear()
    {
        _elements.clear();
        _size = 0;
    }
    void startOver() { _size = 0; } ///< empty; keeps the elements as spares
    void dropSpares();
    void reserve(std::size_t count) { _elements.reserve(count); }
    /// Appends an empty value: null, or an empty text or container when a spare of that kind is reused.
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
    /// `count`: 0 to `size()`.
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
    /// Appends a spare, with its old contents, or null. The caller sets it at once.
    Value& reuse()
    {
        if (_size == _elements.size())
            _elements.emplace_back();
        return _elements[_size++];
    }

    std::vector<Value> _elements; ///< from `_size` on: spares
    std::size_t _size = 0;
};

/// Values under string keys, in the order in which the keys were first set. `startOver` empties the dictionary but
/// keeps the entries as spares, which are reused when the same keys are set in the same order.
class Dictionary {
public:
    struct Entry {
        std::string key;
        Value value;
    };

    Dictionary() = default;
    Dictionary(std::initializer_list<Entry> entries);
    Dictionary(const Dictionary&) = default; // no move: the source would keep its size but lose its entries
    Dictionary& operator=(const Dictionary&) = default;

    std::size_t size() const { return _size; }
    bool empty() const { return _size == 0; }

    /// The value under `key`, null when there is none.
    const Value* find(std::string_view key) const { return valueAt(indexOf(key)); }
    Value* find(std::string_view key) { return const_cast<Value*>(valueAt(advanceTo(key))); }
    /// A copy of the value under `key`; the null value when there is none.
    Value at(std::string_view key) const;
    bool contains(std::string_view key) const { return find(key) != nullptr; }

    /// The value under `key`. A missing key is appended with an empty value: null, or an empty text or container when
    /// a spare of that kind is reused.
    Value& slot(std::string_view key);
    /// Replaces the value under `key` in its place, or appends the key.
    void set(std::string_view key, Value value) { reuse(key) = std::move(value); }
    void set(std::string_view key, Reading reading) { reuse(key).assign(reading); }
    /// As `set`. Does not allocate when the old text's memory is large enough.
    void setText(std::string_view key, std::string_view text) { reuse(key).assignText(text); }
    void remove(std::string_view key);
    void clear();
    void startOver() ///< empty; keeps the entries as spares
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

    // Up to this many keys a linear search is faster than the index.
    static constexpr std::size_t kIndexFrom = 48;

    /// The value under `key`; of a new key a spare, with its old contents, or null. The caller sets it at once.
    Value& reuse(std::string_view key)
    {
        const auto expected = _entries.begin() + static_cast<std::ptrdiff_t>(_next);
        if (expected == _entries.end() || !isSameKey(expected->key, key))
            return reuseElsewhere(key);
        if (_next++ == _size)
            takeSpare();
        return expected->value;
    }
    Value& reuseElsewhere(std::string_view key);
    const Value* valueAt(std::size_t index) const { return index == kNotThere ? nullptr : &_entries[index].value; }
    std::size_t indexOf(std::string_view key) const;
    std::size_t advanceTo(std::string_view key); ///< like `indexOf`; moves `_next` behind the entry
    void takeSpare()
    {
        if (++_size > kIndexFrom)
            index();
    }
    void index();

    std::vector<Entry> _entries; ///< from `_size` on: spares; no two keys are equal
    std::size_t _size = 0;
    // The entry after the last one found, at most `_size`. It is tried first, then the last one itself: decoders set
    // their keys in the same order each time, or the same key again.
    std::size_t _next = 0;
    // Used above `kIndexFrom` keys: property lists from outside may hold many thousands. A sorted map, because a hash
    // can be attacked with colliding keys.
    std::map<std::string, std::size_t, std::less<>> _index;
};

ArrayRef makeArray(std::vector<Value> elements = {});
DictionaryRef makeDictionary(std::initializer_list<Dictionary::Entry> entries = {});

/// A dictionary of the entries before the first null value. The null and all entries after it are ignored.
DictionaryRef makeDictionaryUntilNull(std::initializer_list<Dictionary::Entry> entries);

/// A copy of the top container; its children are shared. A value that is no container is copied.
Value shallowCopy(const Value& value);
/// A copy that shares no container with the original. Data bytes are shared, as they cannot change. Recursive: a
/// container must not contain itself.
Value deepCopy(const Value& value);

/// One line: {"key": "text", "list": [1, 2.5, true, <3 bytes>]}. For logs and test messages.
std::string describe(const Value& value);
std::ostream& operator<<(std::ostream& out, const Value& value);
void PrintTo(const Value& value, std::ostream* out);

} // namespace kestrum
