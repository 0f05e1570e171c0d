#include "support/Value.h"

#include "support/Format.h"

#include <algorithm>
#include <cmath>
#include <ostream>

namespace kestrum {
namespace {

// Enough for the keys of most rows and cells, so that one allocation serves.
constexpr std::size_t kKeysOfARow = 8;

} // namespace

Value::Value(ArrayRef array)
{
    if (array)
        _held = std::move(array);
}

Value::Value(DictionaryRef dictionary)
{
    if (dictionary)
        _held = std::move(dictionary);
}

Value::Kind Value::kind() const
{
    constexpr Kind kinds[] = {Kind::Null,    Kind::String, Kind::String, Kind::Integer, Kind::Integer,   Kind::Real,
                              Kind::Boolean, Kind::Date,   Kind::Data,   Kind::Array,   Kind::Dictionary};
    static_assert(std::size(kinds) == std::variant_size_v<decltype(_held)>);
    return kinds[_held.index()];
}

std::optional<std::string> Value::text() const
{
    if (const auto* held = std::get_if<Reading>(&_held))
        return held->text();
    const auto* held = std::get_if<std::string>(&_held);
    return held ? std::optional(*held) : std::nullopt;
}

std::optional<Reading> Value::reading() const
{
    const auto* held = std::get_if<Reading>(&_held);
    return held ? std::optional(*held) : std::nullopt;
}

std::optional<std::int64_t> Value::integer() const
{
    const auto* held = std::get_if<std::int64_t>(&_held);
    return held ? std::optional(*held) : std::nullopt;
}

std::optional<std::uint64_t> Value::unsignedInteger() const
{
    if (const auto* held = std::get_if<std::uint64_t>(&_held))
        return *held;
    const auto held = integer();
    return held && *held >= 0 ? std::optional(static_cast<std::uint64_t>(*held)) : std::nullopt;
}

std::optional<double> Value::real() const
{
    const auto* held = std::get_if<double>(&_held);
    return held ? std::optional(*held) : std::nullopt;
}

std::optional<bool> Value::boolean() const
{
    const auto* held = std::get_if<bool>(&_held);
    return held ? std::optional(*held) : std::nullopt;
}

std::optional<Date> Value::date() const
{
    const auto* held = std::get_if<Date>(&_held);
    return held ? std::optional(*held) : std::nullopt;
}

ArrayRef Value::array() const
{
    const auto* held = std::get_if<ArrayRef>(&_held);
    return held ? *held : nullptr;
}

DictionaryRef Value::dictionary() const
{
    const auto* held = std::get_if<DictionaryRef>(&_held);
    return held ? *held : nullptr;
}

std::optional<std::int32_t> Value::int32() const
{
    if (const auto whole = integer(); whole && *whole >= INT32_MIN && *whole <= INT32_MAX)
        return static_cast<std::int32_t>(*whole);
    if (const auto number = real();
        number && *number >= INT32_MIN && *number <= INT32_MAX && std::trunc(*number) == *number)
        return static_cast<std::int32_t>(*number);
    return std::nullopt;
}

void Value::startOver()
{
    if (auto* text = std::get_if<std::string>(&_held))
        text->clear();
    else if (const auto* array = std::get_if<ArrayRef>(&_held); array != nullptr && array->use_count() == 1)
        (*array)->startOver();
    else if (const auto* dictionary = std::get_if<DictionaryRef>(&_held);
             dictionary != nullptr && dictionary->use_count() == 1)
        (*dictionary)->startOver();
    else
        _held = std::monostate();
}

template <typename Container>
Container& Value::become()
{
    auto* held = std::get_if<std::shared_ptr<Container>>(&_held);
    if (held == nullptr || held->use_count() > 1) {
        *this = std::make_shared<Container>();
        held = std::get_if<std::shared_ptr<Container>>(&_held);
    } else {
        (*held)->startOver();
    }
    return **held;
}

Array& Value::becomeArray()
{
    return become<Array>();
}

Dictionary& Value::becomeDictionary()
{
    return become<Dictionary>();
}

void Value::assignText(std::string_view text)
{
    auto* held = std::get_if<std::string>(&_held);
    if (held == nullptr)
        _held = std::string(text);
    else
        held->assign(text);
}

bool operator==(const Value& left, const Value& right)
{
    if (left.kind() != right.kind())
        return false;
    switch (left.kind()) {
    case Value::Kind::Array: {
        const auto a = left.array(), b = right.array();
        return a == b || std::equal(a->begin(), a->end(), b->begin(), b->end());
    }
    case Value::Kind::Dictionary: {
        const auto a = left.dictionary(), b = right.dictionary();
        if (a == b)
            return true;
        return a->size() == b->size() && std::all_of(a->begin(), a->end(), [&](const auto& entry) {
                   const Value* other = b->find(entry.key);
                   return other != nullptr && *other == entry.value;
               });
    }
    case Value::Kind::Data:
        return std::ranges::equal(left.data()->bytes(), right.data()->bytes());
    case Value::Kind::Null:
        return true;
    case Value::Kind::String:
        if (const auto reading = left.reading(); reading && reading == right.reading())
            return true;
        return right.borrowedString() != nullptr ? left.is(*right.borrowedString()) : left.is(right.reading()->text());
    case Value::Kind::Integer:
        return left.integer() == right.integer() && left.unsignedInteger() == right.unsignedInteger();
    case Value::Kind::Real:
        return left.real() == right.real();
    case Value::Kind::Boolean:
        return left.boolean() == right.boolean();
    case Value::Kind::Date:
        return left.date() == right.date();
    }
    return false;
}

bool Value::is(std::string_view text) const
{
    if (const auto* held = std::get_if<std::string>(&_held))
        return *held == text;
    const auto* held = std::get_if<Reading>(&_held);
    return held != nullptr && held->text() == text;
}

std::string_view nameOf(Value::Kind kind)
{
    switch (kind) {
    case Value::Kind::Null:
        return "null";
    case Value::Kind::String:
        return "string";
    case Value::Kind::Integer:
        return "integer";
    case Value::Kind::Real:
        return "real";
    case Value::Kind::Boolean:
        return "boolean";
    case Value::Kind::Date:
        return "date";
    case Value::Kind::Data:
        return "data";
    case Value::Kind::Array:
        return "array";
    case Value::Kind::Dictionary:
        return "dictionary";
    }
    return "unknown";
}

void Array::dropSpares()
{
    _elements.erase(end(), _elements.end());
}

Dictionary::Dictionary(std::initializer_list<Entry> entries)
{
    for (const auto& [key, value] : entries)
        set(key, value);
}

std::size_t Dictionary::indexOf(std::string_view key) const
{
    std::size_t at = 0;
    if (_next < _size && _entries[_next].key == key) {
        at = _next;
    } else if (_next > 0 && _entries[_next - 1].key == key) {
        at = _next - 1;
    } else if (!_index.empty()) {
        const auto known = _index.find(key);
        at = known == _index.end() ? _size : known->second;
    } else {
        while (at < _size && _entries[at].key != key)
            ++at;
    }
    return at == _size ? kNotThere : at;
}

std::size_t Dictionary::advanceTo(std::string_view key)
{
    const std::size_t at = indexOf(key);
    if (at != kNotThere)
        _next = at + 1;
    return at;
}

Value Dictionary::at(std::string_view key) const
{
    const Value* found = find(key);
    return found ? *found : Value();
}

Value& Dictionary::slot(std::string_view key)
{
    const std::size_t before = _size;
    Value& value = reuse(key);
    if (_size > before)
        value.startOver();
    return value;
}

Value& Dictionary::reuseElsewhere(std::string_view key)
{
    if (const std::size_t at = advanceTo(key); at != kNotThere)
        return _entries[at].value;
    if (_entries.size() > kIndexFrom)
        dropSpares(); // a search would take long
    // The spare with this key, or the next one under its new key: rows take turns with other keys.
    if (const auto spare = std::ranges::find(end(), _entries.end(), key, &Entry::key); spare != _entries.end()) {
        std::iter_swap(end(), spare);
    } else if (_size < _entries.size()) {
        end()->key = key;
    } else {
        if (_entries.empty())
            _entries.reserve(kKeysOfARow);
        _entries.push_back({std::string(key), Value()});
    }
    takeSpare();
    _next = _size;
    return _entries[_size - 1].value;
}

void Dictionary::index()
{
    for (std::size_t at = _index.size(); at < _size; ++at)
        _index.emplace(_entries[at].key, at);
}

void Dictionary::remove(std::string_view key)
{
    const std::size_t at = indexOf(key);
    if (at == kNotThere)
        return;
    _entries.erase(begin() + static_cast<std::ptrdiff_t>(at));
    --_size;
    _next = 0;
    _index.clear();
    if (_size > kIndexFrom)
        index();
}

void Dictionary::clear()
{
    _entries.clear();
    startOver();
}

void Dictionary::dropSpares()
{
    _entries.erase(end(), _entries.end());
}

ArrayRef makeArray(std::vector<Value> elements)
{
    return std::make_shared<Array>(std::move(elements));
}

DictionaryRef makeDictionary(std::initializer_list<Dictionary::Entry> entries)
{
    return std::make_shared<Dictionary>(entries);
}

DictionaryRef makeDictionaryUntilNull(std::initializer_list<Dictionary::Entry> entries)
{
    auto dictionary = std::make_shared<Dictionary>();
    for (const auto& [key, value] : entries) {
        if (value.isNull())
            break;
        dictionary->set(key, value);
    }
    return dictionary;
}

Value shallowCopy(const Value& value)
{
    if (const auto array = value.array())
        return std::make_shared<Array>(*array);
    if (const auto dictionary = value.dictionary())
        return std::make_shared<Dictionary>(*dictionary);
    return value;
}

Value deepCopy(const Value& value)
{
    Value copy = shallowCopy(value);
    if (const auto array = copy.array())
        for (auto& element : *array)
            element = deepCopy(element);
    if (const auto dictionary = copy.dictionary())
        for (auto& entry : *dictionary)
            entry.value = deepCopy(entry.value);
    return copy;
}

namespace {

void describeInto(std::string& text, const Value& value)
{
    const char* separator = "";
    switch (value.kind()) {
    case Value::Kind::Null:
        text += "null";
        break;
    case Value::Kind::String:
        text += '"' + *value.text() + '"';
        break;
    case Value::Kind::Integer:
        text += value.integer() ? formatted("%ld", *value.integer()) : formatted("%lu", *value.unsignedInteger());
        break;
    case Value::Kind::Real:
        text += formatted("%f", *value.real());
        break;
    case Value::Kind::Boolean:
        text += *value.boolean() ? "true" : "false";
        break;
    case Value::Kind::Date:
        text += dateText(*value.date());
        break;
    case Value::Kind::Data:
        text += formatted("<%lu bytes>", value.data()->size());
        break;
    case Value::Kind::Array:
        text += '[';
        for (const auto array = value.array(); const auto& element : *array) {
            text += std::exchange(separator, ", ");
            describeInto(text, element);
        }
        text += ']';
        break;
    case Value::Kind::Dictionary:
        text += '{';
        for (const auto dictionary = value.dictionary(); const auto& entry : *dictionary) {
            text += std::exchange(separator, ", ");
            text += '"' + entry.key + "\": ";
            describeInto(text, entry.value);
        }
        text += '}';
        break;
    }
}

} // namespace

std::string describe(const Value& value)
{
    std::string text;
    describeInto(text, value);
    return text;
}

std::ostream& operator<<(std::ostream& out, const Value& value)
{
    return out << describe(value);
}

void PrintTo(const Value& value, std::ostream* out)
{
    *out << value;
}

} // namespace kestrum
