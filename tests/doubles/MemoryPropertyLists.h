#pragma once

#include "platform/PropertyLists.h"

#include <map>
#include <set>

namespace kestrum {

/// Property lists that the test lays down: files by path, parsed bytes by their text. What is not laid down is no
/// property list.
class MemoryPropertyLists final : public PropertyLists {
public:
    Value parse(Bytes bytes) const override { return find(parsed, std::string(textOf(bytes))); }
    Value parseOver(Bytes bytes, Value /*spent*/) const override { return parse(bytes); }
    std::optional<Data> toXml(const Value& value) const override
    {
        if (value.isNull() || !writable)
            return std::nullopt;
        return Data(bytesOf(describe(value)));
    }
    Value load(const std::string& path) const override { return deepCopy(find(files, path)); }
    Stored write(const Dictionary& dictionary, const std::string& path) const override
    {
        if (!writable)
            return Stored::Failed;
        if (taken.contains(path))
            return Stored::NameTaken;
        files[path] = deepCopy(std::make_shared<Dictionary>(dictionary));
        return Stored::Written;
    }

    std::map<std::string, Value> parsed;
    mutable std::map<std::string, Value> files;
    std::set<std::string> taken; ///< paths at which something else stands
    bool writable = true;

private:
    static Value find(const std::map<std::string, Value>& among, const std::string& key)
    {
        const auto found = among.find(key);
        return found == among.end() ? Value() : found->second;
    }
};

} // namespace kestrum
