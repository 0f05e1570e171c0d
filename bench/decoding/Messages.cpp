#include "decoding/Messages.h"

#include <stdexcept>

namespace kestrum::bench {
namespace {

/// Writes the format "bplist00" with offsets of two bytes and references of one byte.
class Writer {
public:
    std::vector<std::byte> write(const Value& root)
    {
        text("bplist00");
        const std::size_t top = object(root);
        const std::size_t table = _bytes.size();
        for (const std::size_t offset : _offsets)
            number(offset, 2);
        number(0, 6);
        number(2, 1);
        number(1, 1);
        number(_offsets.size(), 8);
        number(top, 8);
        number(table, 8);
        return std::move(_bytes);
    }

private:
    /// Children are written before their parent.
    std::size_t object(const Value& value)
    {
        std::vector<std::size_t> references;
        if (const auto dictionary = value.dictionary()) {
            for (const auto& entry : *dictionary)
                references.push_back(object(entry.key));
            for (const auto& entry : *dictionary)
                references.push_back(object(entry.value));
            begin(0xD0, dictionary->size());
        } else if (const auto array = value.array()) {
            for (const auto& element : *array)
                references.push_back(object(element));
            begin(0xA0, array->size());
        } else {
            begin(0x50, value.text()->size());
            text(*value.text());
        }
        for (const std::size_t reference : references)
            number(reference, 1);
        return _offsets.size() - 1;
    }

    void begin(unsigned marker, std::size_t count)
    {
        if (_offsets.size() == 250)
            throw std::length_error("more objects than a reference of one byte can name");
        _offsets.push_back(_bytes.size());
        number(marker | (count < 15 ? count : 15), 1);
        if (count >= 15) {
            number(0x10, 1);
            number(count, 1);
        }
    }
    void number(std::size_t value, unsigned width)
    {
        for (unsigned i = width; i-- > 0;)
            _bytes.push_back(static_cast<std::byte>(i < sizeof value ? value >> (8 * i) : 0));
    }
    void text(std::string_view characters)
    {
        for (const std::byte each : bytesOf(characters))
            _bytes.push_back(each);
    }

    std::vector<std::byte> _bytes;
    std::vector<std::size_t> _offsets;
};

} // namespace

std::vector<std::byte> binaryPropertyList(const Value& root)
{
    return Writer().write(root);
}

} // namespace kestrum::bench
