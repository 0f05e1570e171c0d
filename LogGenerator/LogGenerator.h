#pragma once

#include "LogGenerator/State.h"
#include "platform/Roles.h"
#include "support/Bytes.h"
#include "support/Record.h"

#include <memory>
#include <optional>
#include <string_view>
#include <vector>

namespace kestrum {

/// Decodes the diagnostic log of one baseband technology into a state that the caller owns. The roles are borrowed.
/// Main thread only.
class LogGenerator {
public:
    virtual ~LogGenerator() = default;
    LogGenerator(const LogGenerator&) = delete;
    LogGenerator& operator=(const LogGenerator&) = delete;

    /// Creates the generator of a technology (a kVoxLogChannelTechnology_... text); null for any other value.
    static std::unique_ptr<LogGenerator> generatorFromTechnology(const Value& technology, DecodingRoles& roles);

    /// The identifier of the generator's technology.
    virtual std::string_view technology() const = 0;

    /// Whether the state holds the display of another technology, which this generator will remove.
    bool replacesDisplayOf(const State& state) const { return originOfDisplay(state) == Origin::Other; }

    /// Decodes one channel message. May throw for an invalid one; the next message can be decoded.
    virtual void updateState(State& state, Bytes withData) = 0;
    /// The nodes of the display that a message of the code may change, and no other. Nothing when it may change any.
    virtual std::optional<std::vector<Value>> nodesOf(LogCode) const { return std::nullopt; }
    /// The display dictionary, null when there is none yet. Also appends the display to the history.
    virtual Value generateLogUsingState(State& state) = 0;
    /// The command that starts the modem's log.
    virtual DictionaryRef getStartCommand() const = 0;
    /// The contents of a snapshot file: dictionaries with a "Description" each.
    virtual ArrayRef getSaveContentsFromState(const State& state) const = 0;

protected:
    explicit LogGenerator(DecodingRoles& roles);
    /// Selects the constructor that does not initialise the generator and does not log its creation.
    struct Uninitialized {};
    LogGenerator(DecodingRoles& roles, Uninitialized) : _roles(roles) {}

    /// Appends a copy of the display to the history, which keeps the newest five.
    void updateHistoryInState(State& state) const;

    /// Which technology built the "Display" of the state: a restart of the service may change the technology.
    enum class Origin { None, Own, Other, Unknown };
    Origin originOfDisplay(const State& state) const;
    /// Sets "Display", and records in the state that this technology built it.
    void setDisplay(State& state, Value display) const;
    /// Removes another technology's display and its data, so that no old value looks current. "History" stays.
    void dropForeignDisplay(State& state) const;

    DecodingRoles& _roles;
};

} // namespace kestrum
