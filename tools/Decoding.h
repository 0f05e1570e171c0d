#pragma once

#include "LogGenerator/LogGenerator.h"
#include "capture/Position.h"
#include "platform/Console.h"
#include "platform/RecordWatch.h"
#include "platform/SystemLog.h"
#include "support/Date.h"
#include "support/Record.h"

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace kestrum::tools {

/// What happened to the messages of one log code. Each message is counted once: as decoded, or under one of the
/// others.
struct Tally {
    std::uint64_t messages = 0;
    std::uint64_t decoded = 0;
    std::uint64_t tooShort = 0;          ///< for at least one of its decoders
    std::uint64_t withoutSubscriber = 0; ///< no section takes the code
    std::uint64_t refused = 0;           ///< invalid type, missing property list, or contradictory contents

    std::uint64_t dropped() const { return tooShort + refused; }
    Tally& operator+=(const Tally& other);
};

/// "0xB0C2": the notation of log codes in the standards and their tools.
std::string codeText(LogCode code);

/// By effective log code. Empty: messages without a code (the trees of an IFX modem, fragments).
using Statistics = std::map<std::optional<LogCode>, Tally>;

/// Decodes a capture as the display does. It needs only the memory of one display, however long the capture is.
class Decoding {
public:
    /// Gets a line of the system log. Addresses are shown as null, so that two runs log the same.
    using LogLine = std::function<void(Priority, std::string_view)>;

    /// The facts about a decoded message.
    struct Decoded {
        std::optional<Date> time; ///< of the record or the tree, see timeOf
        std::optional<LogCode> code;
        std::optional<Position> position; ///< in the tree, or in the last record of a position, if it is recent
    };
    using Then = std::function<void(const Decoded&)>;

    /// `technology`: an identifier, or empty to find it in the messages. Bundle and lists must outlive this object.
    /// `then`, if set, is called after each message.
    Decoding(std::string_view technology, Bundle& bundle, PropertyLists& lists, LogLine log, Then then);
    ~Decoding();

    /// Stores messages until one shows the technology. Throws std::runtime_error when too many come before it.
    void take(Bytes message);
    /// Call it after the last message. Throws std::runtime_error when there were messages, but none showed the
    /// technology.
    void finish();

    /// Empty while the technology is not known.
    const std::string& technology() const { return _technology; }
    /// The display dictionary; null when there is none.
    Value display() const { return _state.at(StateKey::kDisplay); }
    /// The nodes of the display that a message of the code may change. Nothing when it may change any node.
    std::optional<std::vector<Value>> nodesOf(LogCode code) const { return _generator->nodesOf(code); }
    /// Only while messages are decoded, from the first call of `then` on.
    const LogGenerator& generator() const { return *_generator; }
    const State& state() const { return _state; }
    const Statistics& statistics() const { return _statistics; }
    Tally total() const;

private:
    class Watch;
    class Log;
    class Quiet;

    bool adoptTechnologyOf(Bytes message);
    void use(std::string_view technology);
    void decode(Bytes message);
    bool takePosition(Bytes message);
    void addPosition(Decoded& decoded) const;
    Tally& classified(Bytes message, Decoded& decoded, bool& reaches);
    void endInterval();

    Bundle& _bundle;
    PropertyLists& _lists;
    const bool _isTechnologyGiven;
    std::string _technology;
    Then _then;

    std::unique_ptr<Watch> _watch;
    std::unique_ptr<Log> _log;
    std::unique_ptr<Quiet> _quiet;
    DecodingRoles _roles;
    State _state;
    std::unique_ptr<LogGenerator> _generator;
    std::set<LogCode> _codes; ///< the codes that the generator takes
    std::size_t _inInterval = 0;
    std::optional<Position> _position; ///< of the last record of a position
    std::optional<Date> _positionTime; ///< of that record

    std::vector<std::vector<std::byte>> _early;
    std::size_t _earlyBytes = 0;
    Statistics _statistics;
};

} // namespace kestrum::tools
