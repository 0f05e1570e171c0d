#pragma once

#include "platform/PropertyLists.h"

#include <map>
#include <set>

namespace kestrum {

/// Property lists that the test adds: files by path, parsed bytes by their text. All other bytes are no property
/// list. Lists that are serialised are added too.
class MemoryPropertyLists final : public PropertyLists {
public:
    Value parse(Bytes bytes) override { return deepCopy(find(parsed, std::string(textOf(bytes)))); }
    Value parseOver(Bytes bytes, Value /*spent*/) override { return parse(bytes); }
    std::optional<Data> toXml(const Value& value) const override
    {
        if (value.isNull() || !writable)
            return std::nullopt;
        const auto text = describe(value);
        parsed.insert_or_assign(text, withoutNulls(value));
        return Data(bytesOf(text));
    }
    Value load(const std::string& path) const override { return deepCopy(find(files, path)); }
    Stored write(const Dictionary& dictionary, const std::string& path) const override
    {
        if (!writable)
            return Stored::Failed;
        if (taken.contains(path))
            return Stored::NameTaken;
        files[path] = withoutNulls(std::make_shared<Dictionary>(dictionary));
        return Stored::Written;
    }

    mutable std::map<std::string, Value> parsed; ///< includes lists that were serialised
    mutable std::map<std::string, Value> files;
    std::set<std::string> taken; ///< paths where another file exists already
    bool writable = true;

private:
    /// A deep copy.
    static Value withoutNulls(const Value& value)
    {
        if (const auto dictionary = value.dictionary()) {
            auto copy = std::make_shared<Dictionary>();
            for (const auto& entry : *dictionary)
                if (entry.value)
                    copy->set(entry.key, withoutNulls(entry.value));
            return copy;
        }
        if (const auto array = value.array()) {
            auto copy = makeArray();
            for (const auto& element : *array)
                if (element)
                    copy->append(withoutNulls(element));
            return copy;
        }
        return value;
    }
    static Value find(const std::map<std::string, Value>& among, const std::string& key)
    {
        const auto found = among.find(key);
        return found == among.end() ? Value() : found->second;
    }
};

} // namespace kestrum
