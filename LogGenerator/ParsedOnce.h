#pragma once

#include "platform/PropertyLists.h"

#include <vector>

namespace kestrum {

/// Property lists that remember the list they parsed last: up to five sections read the list of one record, and a
/// service that has nothing new to say repeats itself. Who parses shares the value with the others, and leaves it as
/// it is.
class ParsedOnce final : public PropertyLists {
public:
    explicit ParsedOnce(const PropertyLists& lists) : _lists(lists) {}

    Value parse(Bytes bytes) const override;
    /// What it parsed last is spent instead.
    Value parseOver(Bytes bytes, Value /*spent*/) const override { return parse(bytes); }
    std::optional<Data> toXml(const Value& value) const override { return _lists.toXml(value); }
    Value load(const std::string& path) const override { return _lists.load(path); }
    Stored write(const Dictionary& dictionary, const std::string& path) const override
    {
        return _lists.write(dictionary, path);
    }

private:
    const PropertyLists& _lists;
    mutable std::vector<std::byte> _bytes;
    mutable Value _value; ///< what `_bytes` are
};

} // namespace kestrum
