#pragma once

#include "LogGenerator/LogGenerator.h"
#include "doubles/MemoryBundle.h"
#include "doubles/VirtualClock.h"
#include "harness/Places.h"
#include "platform/ChannelMessage.h"
#include "platform/Console.h"
#include "platform/Roles.h"
#include "platform/SystemLog.h"
#include "platform/propertylist/PropertyListCodec.h"
#include "voxd/scenarios/Scenario.h"

#include <chrono>
#include <functional>
#include <map>
#include <memory>
#include <stdexcept>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum {

/// The number of times each error was logged. All other lines are dropped, because a drive writes millions.
class ErrorCounts final : public SystemLog {
public:
    void write(Priority priority, std::string_view text) override
    {
        if (priority == Priority::Error)
            ++counts[std::string(text)];
    }
    const void* shownAddress(const void*) const override { return nullptr; }

    std::map<std::string, int> counts;
};

/// A console without output: one technology prints its whole display there.
class SilentConsole final : public Console {
public:
    void printLine(std::string_view) override {}
    void debug(std::string_view) override {}
    bool isDebugWatched() const override { return false; }
};

/// A scenario running through the real generators, on the templates that ship with the program.
class ScenarioRun {
public:
    static inline PropertyListCodec kLists = PropertyListCodec();
    static constexpr Date kStart{std::chrono::sys_days(std::chrono::year(2026) / 11 / 16)};

    explicit ScenarioRun(std::string_view scenario, std::uint64_t seed = 1)
        : source(makeScenario(scenario, {seed, kStart, kLists}))
    {
        for (const char* name : {"ZPH_GSM", "LTE", "UTRAN", "C2KTemplate"})
            bundle.paths.push_back(inCheckout("resources/").append(name).append(".plist"));
    }

    /// Decodes the next message. The generator changes with the technology, as when a display reconnects.
    const Source::Message& decodeNext()
    {
        auto next = source->next();
        if (!next)
            throw std::runtime_error("a scenario never ends");
        message = std::move(*next);
        if (!generator || generator->technology() != source->technology())
            generator = LogGenerator::generatorFromTechnology(Value(source->technology()), roles);
        const auto record = channelRecord(message.bytes);
        code = record ? record->code : 0;
        generator->updateState(state, message.bytes);
        return message;
    }

    /// Decodes for that time, calls `after` after every message, and refreshes every 2 s as the display does.
    void decodeFor(
        std::chrono::microseconds time, const std::function<void()>& after = [] {})
    {
        const auto end = message.at + time;
        while (decodeNext().at < end) {
            after();
            if (message.at >= refresh) {
                generator->generateLogUsingState(state);
                refresh = message.at + std::chrono::seconds(2);
            }
        }
    }

    Value display() const { return state.at("Display"); }

    ErrorCounts log;
    SilentConsole console;
    VirtualClock clock;
    MemoryBundle bundle;
    PropertyListCodec lists;
    DecodingRoles roles{log, console, clock, bundle, lists};

    std::unique_ptr<ScenarioSource> source;
    std::unique_ptr<LogGenerator> generator;
    State state;
    Source::Message message{};
    LogCode code = 0; ///< of the last message
    std::chrono::microseconds refresh{0};
};

/// Calls `seen` for each text of the tree with its path: dictionary keys joined by "/", "[]" for a row of a list. An
/// empty list counts as an empty text. Other values are shown as `describe` shows them.
inline void eachText(const Value& node, const std::string& path,
                     const std::function<void(const std::string& path, const std::string& text)>& seen)
{
    if (const auto dictionary = node.dictionary()) {
        for (const auto& [key, value] : *dictionary)
            if (key != "_sorted")
                eachText(value, path.empty() ? key : path + "/" + key, seen);
    } else if (const auto array = node.array()) {
        if (array->empty())
            seen(path, "");
        for (const auto& each : *array)
            eachText(each, path + "[]", seen);
    } else {
        seen(path, node.text().value_or(describe(node)));
    }
}

/// The value under a key, anywhere in the tree; null when there is none.
inline Value nodeNamed(std::string_view name, const Value& tree)
{
    if (const auto dictionary = tree.dictionary()) {
        if (const Value* found = dictionary->find(name))
            return *found;
        for (const auto& entry : *dictionary)
            if (Value found = nodeNamed(name, entry.value))
                return found;
    }
    return {};
}

/// The text that a section shows under a key; empty when there is none.
inline std::string textAt(const Value& tree, std::string_view section, std::string_view key)
{
    const auto node = nodeNamed(section, tree).dictionary();
    const Value found = node ? node->at(key) : Value();
    return found.text().value_or("");
}

} // namespace kestrum
