#include "platform/propertylist/BinaryReader.h"

#include "platform/propertylist/Limits.h"
#include "support/Format.h"
#include "support/Utf8.h"

#include <bit>
#include <cmath>

namespace kestrum::propertylist {
namespace {

// The file: header, objects, table of the objects' offsets, trailer. The trailer: 6 unused bytes, the widths of an
// offset and of a reference (1 byte each), the number of objects, the root's number and the table's offset (8 bytes
// each). All numbers are big-endian.
constexpr std::size_t kTrailer = 32;

// Objects may be shared, so the value can be larger than its file. Ordinary files share little.
constexpr std::size_t kMaxGrowth = 64;

constexpr Date kEpoch = std::chrono::sys_days(std::chrono::year{2001} / 1 / 1);
constexpr Date kFirstDate = std::chrono::sys_days(std::chrono::year{0} / 1 / 1);
constexpr Date kLastDate = std::chrono::sys_days(std::chrono::year{10000} / 1 / 1) - std::chrono::microseconds{1};

Value dateFrom(double secondsSince2001)
{
    using Seconds = std::chrono::duration<double>;
    if (!(secondsSince2001 >= Seconds(kFirstDate - kEpoch).count() &&
          secondsSince2001 <= Seconds(kLastDate - kEpoch).count()))
        throw Refusal{"a date outside the years 0 to 9999"};
    return std::min(kLastDate, kEpoch + std::chrono::round<std::chrono::microseconds>(Seconds(secondsSince2001)));
}

class BinaryReader {
public:
    explicit BinaryReader(Bytes bytes)
        : _bytes(bytes),
          _budget(std::min(PropertyListCodec::kMaxNodes, kMaxGrowth * bytes.size()),
                  std::min(PropertyListCodec::kMaxBytes, kMaxGrowth * bytes.size()))
    {}

    Value read()
    {
        try {
            const Value root = begin(readTrailer());
            while (!_open.empty())
                step();
            return root;
        } catch (Refusal& refusal) {
            refusal.offset = _at;
            throw;
        }
    }

private:
    /// A container whose children are not all read.
    struct Open {
        std::size_t object;
        ArrayRef array;
        DictionaryRef dictionary;
        std::size_t references; ///< offset of the first one; a dictionary's keys come before its values
        std::size_t count;
        std::size_t next = 0;
    };

    /// Reads the trailer and gives the root's number.
    std::size_t readTrailer()
    {
        if (_bytes.size() < kBinaryMagic.size() + kTrailer)
            throw Refusal{"too short for a binary property list"};
        const std::size_t trailer = _at = _bytes.size() - kTrailer;
        _offsetWidth = static_cast<std::size_t>(number(trailer + 6, 1));
        _referenceWidth = static_cast<std::size_t>(number(trailer + 7, 1));
        const std::uint64_t objects = number(trailer + 8, 8), root = number(trailer + 16, 8);
        const std::uint64_t table = number(trailer + 24, 8);
        if (_offsetWidth < 1 || _offsetWidth > 8 || _referenceWidth < 1 || _referenceWidth > 8)
            throw Refusal{"a width that is not 1 to 8 bytes"};
        if (table < kBinaryMagic.size() || table > trailer || objects > (trailer - table) / _offsetWidth)
            throw Refusal{"the offset table does not lie inside the file"};
        if (root >= objects)
            throw Refusal{"the root is not an object of the file"};
        _table = static_cast<std::size_t>(table);
        _inside.resize(static_cast<std::size_t>(objects));
        return static_cast<std::size_t>(root);
    }

    /// Reads the next child of the innermost container.
    void step()
    {
        const std::size_t inner = _open.size() - 1;
        if (_open[inner].next == _open[inner].count) {
            _inside[_open[inner].object] = false;
            _open.pop_back();
            return;
        }
        const std::size_t index = _open[inner].next++;
        if (_open[inner].array) {
            // `begin` may open another container and move the elements of `_open`: use the index.
            Value element = begin(reference(_open[inner], index));
            _open[inner].array->append(std::move(element));
            return;
        }
        const std::string key = keyOf(reference(_open[inner], index));
        Value value = begin(reference(_open[inner], _open[inner].count + index));
        _open[inner].dictionary->set(key, std::move(value));
    }

    std::size_t reference(const Open& open, std::size_t index)
    {
        _at = open.references + index * _referenceWidth;
        const std::uint64_t object = number(_at, _referenceWidth);
        if (object >= _inside.size())
            throw Refusal{"a reference to an object that is not in the file"};
        return static_cast<std::size_t>(object);
    }

    std::string keyOf(std::size_t object)
    {
        moveTo(object);
        const unsigned marker = takeMarker();
        if (marker >> 4 != 0x5 && marker >> 4 != 0x6)
            throw Refusal{"a key that is not a string"};
        return text(marker);
    }

    /// Reads an object. A container is returned empty and becomes the innermost open one.
    Value begin(std::size_t object)
    {
        _budget.takeNode();
        moveTo(object);
        const unsigned marker = takeMarker();
        switch (marker >> 4) {
        case 0x0:
            if (marker == 0x08 || marker == 0x09)
                return marker == 0x09;
            break;
        case 0x1:
            return integer(marker & 0xF);
        case 0x2:
            if (marker == 0x22)
                return std::bit_cast<float>(static_cast<std::uint32_t>(takeNumber(4)));
            if (marker == 0x23)
                return std::bit_cast<double>(takeNumber(8));
            break;
        case 0x3:
            if (marker == 0x33)
                return dateFrom(std::bit_cast<double>(takeNumber(8)));
            break;
        case 0x4:
            return Data(takePayload(takeCount(marker), 1));
        case 0x5:
        case 0x6:
            return text(marker);
        case 0xA:
            return open(object, takeCount(marker), makeArray(), nullptr);
        case 0xD:
            return open(object, takeCount(marker), nullptr, makeDictionary());
        default:
            break;
        }
        throw Refusal{formatted("an object of unknown kind 0x%02x", marker)};
    }

    Value open(std::size_t object, std::size_t count, const ArrayRef& array, const DictionaryRef& dictionary)
    {
        if (_inside[object])
            throw Refusal{"a container inside itself"};
        checkDepth(_open.size());
        const std::size_t references = _at;
        checkRoom(count, dictionary ? 2 * _referenceWidth : _referenceWidth);
        _inside[object] = true;
        _open.push_back({object, array, dictionary, references, count});
        return array ? Value(array) : Value(dictionary);
    }

    /// An integer of 2^`exponent` bytes: 1, 2 and 4 are unsigned, 8 signed, 16 for numbers above 2^63-1.
    Value integer(unsigned exponent)
    {
        if (exponent <= 2)
            return takeNumber(std::size_t{1} << exponent);
        if (exponent == 3)
            return static_cast<std::int64_t>(takeNumber(8));
        if (exponent == 4) {
            const std::uint64_t high = takeNumber(8), low = takeNumber(8);
            if (high == 0)
                return low;
            if (high == UINT64_MAX && static_cast<std::int64_t>(low) < 0)
                return static_cast<std::int64_t>(low);
        }
        throw Refusal{"not an integer of 64 bits"};
    }

    /// A text in ASCII or in big-endian UTF-16.
    std::string text(unsigned marker)
    {
        if (marker >> 4 == 0x6)
            return utf16(takePayload(takeCount(marker), 2));
        const auto ascii = textOf(takePayload(takeCount(marker), 1));
        if (!std::all_of(ascii.begin(), ascii.end(), [](char c) { return static_cast<unsigned char>(c) < 0x80; }))
            throw Refusal{"a string that is not ASCII"};
        return std::string(ascii);
    }

    static std::string utf16(Bytes bytes)
    {
        const auto unit = [&](std::size_t i) {
            return static_cast<char32_t>(std::to_integer<unsigned>(bytes[i]) << 8 |
                                         std::to_integer<unsigned>(bytes[i + 1]));
        };
        std::string text;
        for (std::size_t i = 0; i < bytes.size(); i += 2) {
            char32_t character = unit(i);
            if (character >= 0xD800 && character <= 0xDFFF) {
                const char32_t low = i + 2 < bytes.size() ? unit(i + 2) : 0;
                if (character > 0xDBFF || low < 0xDC00 || low > 0xDFFF)
                    throw Refusal{"half of a surrogate pair"};
                character = 0x10000 + ((character & 0x3FF) << 10 | (low & 0x3FF));
                i += 2;
            }
            appendUtf8(text, character);
        }
        return text;
    }

    /// The count in the marker's lower half, or in the integer that follows the marker.
    std::size_t takeCount(unsigned marker)
    {
        if ((marker & 0xF) != 0xF)
            return marker & 0xF;
        const unsigned size = takeMarker();
        if (size >> 4 != 0x1 || (size & 0xF) > 3)
            throw Refusal{"a count that is not an integer"};
        return static_cast<std::size_t>(takeNumber(std::size_t{1} << (size & 0xF)));
    }

    Bytes takePayload(std::size_t count, std::size_t width)
    {
        checkRoom(count, width);
        _budget.takeBytes(count * width);
        _at += count * width;
        return _bytes.subspan(_at - count * width, count * width);
    }

    unsigned takeMarker() { return static_cast<unsigned>(takeNumber(1)); }

    std::uint64_t takeNumber(std::size_t width)
    {
        checkRoom(1, width);
        _at += width;
        return number(_at - width, width);
    }

    void moveTo(std::size_t object)
    {
        _at = _table + object * _offsetWidth;
        const std::uint64_t offset = number(_at, _offsetWidth);
        if (offset < kBinaryMagic.size() || offset >= _table)
            throw Refusal{"an object outside the file"};
        _at = static_cast<std::size_t>(offset);
    }

    /// Throws unless `count` items of `width` bytes follow before the offset table.
    void checkRoom(std::size_t count, std::size_t width) const
    {
        if (count > (_table - _at) / width)
            throw Refusal{"an object that extends into the offset table"};
    }

    /// The caller has checked that the bytes lie inside the file.
    std::uint64_t number(std::size_t offset, std::size_t width) const
    {
        std::uint64_t value = 0;
        for (const std::byte byte : _bytes.subspan(offset, width))
            value = value << 8 | std::to_integer<std::uint64_t>(byte);
        return value;
    }

    Bytes _bytes;
    Budget _budget;
    std::size_t _at = 0; ///< the current offset; after a refusal the place of the fault
    std::size_t _offsetWidth = 0, _referenceWidth = 0, _table = 0;
    std::vector<bool> _inside; ///< for each object: whether it is an open container
    std::vector<Open> _open;
};

} // namespace

Value readBinary(Bytes bytes)
{
    return BinaryReader(bytes).read();
}

} // namespace kestrum::propertylist
