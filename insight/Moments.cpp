#include "insight/Moments.h"

#include "LogGenerator/State.h"
#include "platform/Clock.h"

#include <algorithm>
#include <memory>
#include <string>
#include <utility>

namespace kestrum {
namespace {

// Arrays and dictionaries, element by element.

const Value& valueAt(const Array& array, std::size_t at)
{
    return array[at];
}
const Value& valueAt(const Dictionary& dictionary, std::size_t at)
{
    return dictionary.begin()[static_cast<std::ptrdiff_t>(at)].value;
}
template <typename Container>
Value& valueAt(Container& container, std::size_t at)
{
    return const_cast<Value&>(valueAt(std::as_const(container), at));
}

/// The value at the same place of another refresh's container; null when it has no such place.
const Value* counterpart(const Array& /*now*/, const Array* other, std::size_t at)
{
    return other && at < other->size() ? &valueAt(*other, at) : nullptr;
}
const Value* counterpart(const Dictionary& now, const Dictionary* other, std::size_t at)
{
    if (!other || at >= other->size())
        return nullptr;
    const auto place = static_cast<std::ptrdiff_t>(at);
    return isSameKey(other->begin()[place].key, now.begin()[place].key) ? &valueAt(*other, at) : nullptr;
}

/// Copies of the container alone, without its spares.
ArrayRef copyOf(const Array& array)
{
    return makeArray({array.begin(), array.end()});
}
DictionaryRef copyOf(const Dictionary& dictionary)
{
    auto copy = std::make_shared<Dictionary>(dictionary);
    copy->dropSpares();
    return copy;
}

/// Whether a value that is no container is the same. Formats no reading for it.
bool isSame(const Value& now, const Value& before)
{
    if (const Reading* reading = now.borrowedReading())
        return before.borrowedReading() && *reading == *before.borrowedReading();
    if (const std::string* text = now.borrowedString())
        return before.borrowedString() && *text == *before.borrowedString();
    if (const Data* data = now.data())
        return before.data() && data->sharesStorageWith(*before.data());
    return now == before;
}

std::optional<Value> changed(const Value& now, const Value* before);

template <typename Container>
std::optional<Value> changedContainer(const Container& now, const Container* before)
{
    std::shared_ptr<Container> copy;
    if (!before || before->size() != now.size())
        copy = copyOf(now);
    for (std::size_t at = 0; at < now.size(); ++at) {
        const Value* was = counterpart(now, before, at);
        auto fresh = changed(valueAt(now, at), was);
        if (fresh && !copy) {
            copy = copyOf(now);
            for (std::size_t each = 0; each < at; ++each)
                valueAt(*copy, each) = *counterpart(now, before, each);
        }
        if (copy)
            valueAt(*copy, at) = fresh ? *std::move(fresh) : *was;
    }
    return copy ? std::optional<Value>(std::move(copy)) : std::nullopt;
}

/// A deep copy that shares with `before` the containers that are still the same; nothing when all is the same.
/// Recursive: at most as deep as property lists may be (512 levels).
std::optional<Value> changed(const Value& now, const Value* before)
{
    if (const auto* dictionary = now.borrowedDictionary())
        return changedContainer(*dictionary, before ? before->borrowedDictionary() : nullptr);
    if (const auto* array = now.borrowedArray())
        return changedContainer(*array, before ? before->borrowedArray() : nullptr);
    if (before && isSame(now, *before))
        return std::nullopt;
    return now;
}

// Memory

constexpr std::size_t kBlock = 16;                               // what the allocator adds to an allocation
constexpr std::size_t kOwners = 2 * sizeof(int) + sizeof(void*); // what shared_ptr adds to a container
constexpr std::size_t kIndexEntry = sizeof(std::string) + 6 * sizeof(void*);
constexpr std::size_t kIndexFrom = 48; // keys; larger dictionaries have an index with a copy of each key

std::size_t bytesOf(const std::string& text)
{
    static const std::size_t inside = std::string().capacity();
    return text.capacity() > inside ? text.capacity() + 1 + kBlock : 0;
}

std::size_t bytesOf(const Value& value, const Value* neighbour);

template <typename Container>
std::size_t bytesOfElements(const Container& container, const Container* neighbour)
{
    if (&container == neighbour)
        return 0;
    std::size_t bytes = sizeof(Container) + kOwners + 2 * kBlock;
    for (std::size_t at = 0; at < container.size(); ++at)
        bytes += bytesOf(valueAt(container, at), counterpart(container, neighbour, at));
    return bytes;
}

std::size_t bytesOfKeys(const Dictionary& dictionary)
{
    std::size_t bytes = 0;
    const bool indexed = dictionary.size() > kIndexFrom;
    for (const auto& [key, value] : dictionary)
        bytes += sizeof(std::string) + bytesOf(key) + (indexed ? kIndexEntry + kBlock + bytesOf(key) : 0);
    return bytes;
}

/// The memory that a copy takes beyond its neighbour's: the refresh before it or after it.
std::size_t bytesOf(const Value& value, const Value* neighbour)
{
    std::size_t bytes = sizeof(Value);
    if (const auto* dictionary = value.borrowedDictionary()) {
        const auto* other = neighbour ? neighbour->borrowedDictionary() : nullptr;
        bytes += bytesOfElements(*dictionary, other) + (dictionary == other ? 0 : bytesOfKeys(*dictionary));
    } else if (const auto* array = value.borrowedArray()) {
        bytes += bytesOfElements(*array, neighbour ? neighbour->borrowedArray() : nullptr);
    } else if (const auto* text = value.borrowedString()) {
        bytes += bytesOf(*text);
    } else if (const auto* data = value.data()) {
        bytes += neighbour && neighbour->data() && data->sharesStorageWith(*neighbour->data()) ? 0 : data->size();
    }
    return bytes;
}

std::size_t bytesOf(const Moment& moment, const Moment* neighbour)
{
    const Value other = neighbour ? Value(neighbour->entry) : Value();
    return sizeof(Moment) + bytesOf(moment.entry, &other);
}

} // namespace

Value Moment::display() const
{
    return entry->at(StateKey::kDisplay);
}

void Moments::displayMade(const Dictionary& entry)
{
    const Moment* before = _moments.empty() ? nullptr : &_moments.back();
    auto copy = changedContainer(entry, before ? before->entry.get() : nullptr);
    // Each moment has a separate entry, so that its raw records can be dropped alone.
    Moment moment{++_made, _clock.now(), copy ? copy->dictionary() : copyOf(*before->entry)};
    _bytes += bytesOf(moment, before);
    _moments.push_back(std::move(moment));
    keepLimits();
}

std::optional<Moment> Moments::newest() const
{
    return _moments.empty() ? std::nullopt : std::optional(_moments.back());
}

std::optional<Moment> Moments::before(const Moment& moment) const
{
    const auto next = std::ranges::lower_bound(_moments, moment.number, {}, &Moment::number);
    return next == _moments.begin() ? std::nullopt : std::optional(*std::prev(next));
}

std::optional<Moment> Moments::after(const Moment& moment) const
{
    const auto next = std::ranges::upper_bound(_moments, moment.number, {}, &Moment::number);
    return next == _moments.end() ? std::nullopt : std::optional(*next);
}

ArrayRef Moments::entriesUpTo(const Moment& last, std::size_t count) const
{
    auto end = std::ranges::lower_bound(_moments, last.number, {}, &Moment::number);
    auto entries = makeArray();
    const auto earlier = std::min(count - 1, static_cast<std::size_t>(end - _moments.begin()));
    for (auto each = end - static_cast<std::ptrdiff_t>(earlier); each != end; ++each)
        entries->append(each->entry);
    entries->append(last.entry);
    return entries;
}

void Moments::keepLimits()
{
    while (_moments.size() > _limits.moments)
        dropOldest();
    while (_bytes > _limits.bytes && !_moments.empty())
        if (!dropOldestRawRecords())
            dropOldest();
}

bool Moments::dropOldestRawRecords()
{
    const auto next = std::ranges::upper_bound(_moments, _withoutRaw, {}, &Moment::number);
    if (next == _moments.end())
        return false;
    _withoutRaw = next->number;
    if (const Value* raw = next->entry->find(StateKey::kDisplayState); raw && raw->data()) {
        _bytes -= raw->data()->size();
        // A new entry: a caller that holds this moment keeps its records.
        next->entry = copyOf(*next->entry);
        next->entry->set(StateKey::kDisplayState, Data());
    }
    return true;
}

void Moments::dropOldest()
{
    _bytes -= bytesOf(_moments.front(), _moments.size() > 1 ? &_moments[1] : nullptr);
    _moments.pop_front();
}

} // namespace kestrum
