#pragma once

#include "LogGenerator/State.h"
#include "platform/Roles.h"
#include "support/Bytes.h"

#include <memory>
#include <string_view>

namespace kestrum {

/// Interprets the diagnostic log of one baseband technology. It keeps its decoding machinery alone; what it decodes
/// goes into the state. Main thread only.
class LogGenerator {
public:
    virtual ~LogGenerator() = default;
    LogGenerator(const LogGenerator&) = delete;
    LogGenerator& operator=(const LogGenerator&) = delete;

    /// A new generator for the technology that the telephony service named; null for any other value.
    static std::unique_ptr<LogGenerator> generatorFromTechnology(const Value& technology, DecodingRoles& roles);

    /// The identifier of the technology it decodes.
    virtual std::string_view technology() const = 0;

    /// Whether the state holds the display of another technology, which this one will put aside.
    bool replacesDisplayOf(const State& state) const { return originOfDisplay(state) == Origin::Other; }

    /// Decodes one channel message. What it throws ends this message alone.
    virtual void updateState(State& state, Bytes withData) = 0;
    /// The display dictionary (null when there is none yet); also rolls the history.
    virtual Value generateLogUsingState(State& state) = 0;
    /// The dictionary that starts the modem's log.
    virtual DictionaryRef getStartCommand() const = 0;
    /// What a snapshot file holds: a list of dictionaries, each with a "Description".
    virtual ArrayRef getSaveContentsFromState(const State& state) const = 0;

protected:
    explicit LogGenerator(DecodingRoles& roles);
    /// Stays without the initialisation that logs its creation.
    struct Uninitialized {};
    LogGenerator(DecodingRoles& roles, Uninitialized) : _roles(roles) {}

    /// Appends a snapshot of the display to the history, which keeps the newest five.
    void updateHistoryInState(State& state) const;

    /// Who built the "Display" of the state. A restart of the service may have brought another technology since.
    enum class Origin { None, Own, Other, Unknown };
    Origin originOfDisplay(const State& state) const;
    /// Sets "Display", and remembers that this technology built it.
    void setDisplay(State& state, Value display) const;
    /// Removes what another technology left to be shown, so that nothing of it looks current. "History" stays.
    void dropForeignDisplay(State& state) const;

    DecodingRoles& _roles;
};

} // namespace kestrum
