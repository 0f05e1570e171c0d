#pragma once

#include "LogGenerator/ZPHLogGenerator2.h"
#include "doubles/DecodingDoubles.h"
#include "harness/Places.h"
#include "platform/propertylist/PropertyListCodec.h"

#include <memory>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

inline std::set<std::string, std::less<>> keysOf(const Value& dictionary)
{
    std::set<std::string, std::less<>> keys;
    if (const auto held = dictionary.dictionary())
        for (const auto& entry : *held)
            keys.insert(entry.key);
    return keys;
}

/// The value under a key, anywhere in the tree; null when there is none.
inline Value nodeNamed(std::string_view name, const Value& tree)
{
    if (const auto dictionary = tree.dictionary()) {
        if (dictionary->contains(name))
            return dictionary->at(name);
        for (const auto& entry : *dictionary)
            if (Value found = nodeNamed(name, entry.value))
                return found;
    }
    return {};
}

/// A technology's generator on the template that ships with the program.
template <typename Generator>
class TechnologyRun {
public:
    explicit TechnologyRun(std::string_view templateName,
                           std::unique_ptr<Generator> (*make)(DecodingRoles&) = &Generator::generator)
    {
        doubles.bundle.paths = {resource(templateName)};
        generator = make(roles);
    }

    static std::string resource(std::string_view templateName)
    {
        return inCheckout("resources/").append(templateName).append(".plist");
    }

    void receive(Bytes message) { generator->updateState(state, message); }

    Value display() const { return state.at("Display"); }
    Value section(std::string_view name) const { return nodeNamed(name, display()); }

    DecodingDoubles doubles;
    PropertyListCodec codec;
    DecodingRoles roles{doubles.log, doubles.console, doubles.clock, doubles.bundle, codec};
    State state;
    std::unique_ptr<Generator> generator;
};

} // namespace kestrum
