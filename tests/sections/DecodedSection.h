#pragma once

#include "LogGenerator/Base.h"
#include "doubles/DecodingDoubles.h"
#include "sections/RecordBuilder.h"

#include <stdexcept>
#include <string>
#include <utility>

namespace kestrum {

/// A section with its node and its log.
template <typename Section>
class DecodedSection {
public:
    template <typename... Records>
    explicit DecodedSection(Value node, const Records&... records) : _node(std::move(node)), _section(_doubles.roles)
    {
        _section.updateSectionRef(_node);
        log().lines.clear();
        (receive(records), ...);
    }

    /// Passes one record to the section, under the record's code unless another one is given.
    DecodedSection& receive(const RecordBuilder& record) { return receive(record, record.code()); }
    DecodedSection& receive(const RecordBuilder& record, LogCode code)
    {
        if (const Value& list = record.propertyList())
            _doubles.propertyLists.parsed[describe(list)] = list;
        _section.updateWithData(Record(record.bytes()), code);
        return *this;
    }

    /// The section's whole display.
    const Value& node() const { return _node; }
    /// The section's text in one line: `{"Cell ID": "12"}` or `[{"ARFCN": "3"}]`.
    std::string text() const { return describe(_node); }

    /// For a dictionary section: the value under `key`; null when there is none.
    Value at(std::string_view key) const { return _node.dictionary()->at(key); }
    bool contains(std::string_view key) const { return _node.dictionary()->contains(key); }

    /// For a list section.
    std::size_t size() const { return _node.array()->size(); }
    DictionaryRef row(std::size_t index) const
    {
        const auto found = index < size() ? (*_node.array())[index].dictionary() : nullptr;
        if (!found)
            throw std::out_of_range("no such row in " + text());
        return found;
    }

    Section& section() { return _section; }
    DecodingDoubles& doubles() { return _doubles; }
    RecordingLog& log() { return _doubles.log; }
    const RecordingLog& log() const { return _doubles.log; }

private:
    DecodingDoubles _doubles;
    Value _node;
    Section _section;
};

/// A dictionary section after these records.
template <typename Section, typename... Records>
DecodedSection<Section> decoded(const Records&... records)
{
    return DecodedSection<Section>(makeDictionary(), records...);
}

/// A list section after these records.
template <typename Section, typename... Records>
DecodedSection<Section> decodedList(const Records&... records)
{
    return DecodedSection<Section>(makeArray(), records...);
}

} // namespace kestrum
