#pragma once

#include "platform/PropertyLists.h"

#include <vector>

namespace kestrum {

/// Caches the last parsed property list: up to five sections read the list of one record, and the service often repeats
/// a list. Callers share the value and must not change it.
class ParsedOnce final : public PropertyLists {
public:
    explicit ParsedOnce(PropertyLists& lists) : _lists(lists) {}

    Value parse(Bytes bytes) override;
    /// Ignores its second argument: the memory of the cached value is reused.
    Value parseOver(Bytes bytes, Value /*spent*/) override { return parse(bytes); }
    std::optional<Data> toXml(const Value& value) const override { return _lists.toXml(value); }
    Value load(const std::string& path) const override { return _lists.load(path); }
    Stored write(const Dictionary& dictionary, const std::string& path) const override
    {
        return _lists.write(dictionary, path);
    }

private:
    PropertyLists& _lists;
    std::vector<std::byte> _bytes;
    Value _value; ///< parsed from `_bytes`
};

} // namespace kestrum
