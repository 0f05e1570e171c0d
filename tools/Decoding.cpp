#include "tools/Decoding.h"

#include "capture/MessageTime.h"
#include "capture/PositionRecord.h"
#include "capture/Technology.h"
#include "platform/ChannelMessage.h"
#include "platform/Clock.h"
#include "platform/PropertyLists.h"
#include "platform/TelephonyService.h"
#include "support/Format.h"

#include <algorithm>
#include <stdexcept>
#include <utility>

namespace kestrum::tools {
namespace {

// Messages before the first one that shows the technology cannot be decoded yet.
constexpr std::size_t kMostEarlyBytes = 16 << 20;

// After this many bytes the generator drops the raw records that it keeps for a snapshot.
constexpr std::size_t kInterval = 256 << 10;

/// The codes that the generator requests in a start command.
std::set<LogCode> codesIn(const LogGenerator& generator)
{
    std::set<LogCode> codes;
    const auto command = generator.getStartCommand();
    const auto add = [&](std::string_view key, LogCode above) {
        if (const auto list = command->at(key).array())
            for (const auto& code : *list)
                codes.insert(above + static_cast<LogCode>(code.integer().value_or(0)));
    };
    add("SetZephraLogCodes", 0);
    add("SetVoxExtraCodes", ChannelMessage::kExtraCodes);
    return codes;
}

} // namespace

std::string codeText(LogCode code)
{
    int digits = 4;
    while (digits < 8 && code >> (4 * digits) != 0)
        ++digits;
    std::string text = "0x";
    for (int at = digits; at-- > 0;)
        text += "0123456789ABCDEF"[code >> (4 * at) & 0xF];
    return text;
}

Tally& Tally::operator+=(const Tally& other)
{
    messages += other.messages;
    decoded += other.decoded;
    tooShort += other.tooShort;
    withoutSubscriber += other.withoutSubscriber;
    refused += other.refused;
    return *this;
}

class Decoding::Watch final : public RecordWatch {
public:
    void tooShort() override { wasTooShort = true; }
    bool wasTooShort = false;
};

class Decoding::Log final : public SystemLog {
public:
    explicit Log(LogLine line) : _line(std::move(line)) {}
    void write(Priority priority, std::string_view text) override
    {
        if (_line)
            _line(priority, text);
    }
    bool passes(Priority) const override { return static_cast<bool>(_line); }
    const void* shownAddress(const void*) const override { return nullptr; }

private:
    LogLine _line;
};

// Standard output holds only the display, and a capture is decoded without today's date.
class Decoding::Quiet final : public Console, public Clock {
public:
    void printLine(std::string_view) override {}
    void debug(std::string_view) override {}
    bool isDebugWatched() const override { return false; }

    Date now() const override { return moment; }
    Zone zoneAt(Date) const override { return {std::chrono::seconds(0), false}; }
    std::string localText(Date date, std::string_view) const override { return dateText(date); }

    Date moment{};
};

Decoding::Decoding(std::string_view technology, Bundle& bundle, PropertyLists& lists, LogLine log, Then then)
    : _bundle(bundle),
      _lists(lists),
      _isTechnologyGiven(!technology.empty()),
      _then(std::move(then)),
      _watch(std::make_unique<Watch>()),
      _log(std::make_unique<Log>(std::move(log))),
      _quiet(std::make_unique<Quiet>()),
      _roles{*_log, *_quiet, *_quiet, _bundle, _lists, _watch.get()}
{
    if (_isTechnologyGiven)
        use(technology);
}

Decoding::~Decoding() = default;

void Decoding::take(Bytes message)
{
    if (!_isTechnologyGiven && adoptTechnologyOf(message))
        for (const auto& early : std::exchange(_early, {}))
            decode(early);
    if (_generator)
        return decode(message);
    _earlyBytes += message.size();
    if (_earlyBytes > kMostEarlyBytes)
        throw std::runtime_error(formatted(
            "the first %lu messages do not show the technology: set it with --technology", _early.size() + 1));
    _early.emplace_back(message.begin(), message.end());
}

void Decoding::finish()
{
    if (!_early.empty())
        throw std::runtime_error("the messages do not show the technology: set it with --technology");
    if (_generator)
        endInterval();
}

Tally Decoding::total() const
{
    Tally sum;
    for (const auto& [code, tally] : _statistics)
        sum += tally;
    sum.messages += _early.size();
    return sum;
}

// True when a generator was created. A log that continues in another technology gets another generator, as on the
// live channel. A record counts only if a display of its technology takes its code.
bool Decoding::adoptTechnologyOf(Bytes message)
{
    const auto technology = technologyOf(message);
    if (!technology || *technology == _technology)
        return false;
    if (_generator) {
        const auto record = channelRecord(message);
        if (record && _codes.contains(record->code))
            return false;
        Log silent(nullptr);
        DecodingRoles roles{silent, *_quiet, *_quiet, _bundle, _lists};
        const bool takes =
            record ? codesIn(*LogGenerator::generatorFromTechnology(*technology, roles)).contains(record->code)
                   : !_lists.parse(message).isNull();
        if (!takes)
            return false;
        endInterval();
    }
    use(*technology);
    return true;
}

void Decoding::use(std::string_view technology)
{
    _technology = technology;
    _generator = LogGenerator::generatorFromTechnology(technology, _roles);
    _codes = codesIn(*_generator);
}

void Decoding::decode(Bytes message)
{
    if (takePosition(message))
        return;
    Decoded decoded;
    bool reaches = false;
    Tally& tally = classified(message, decoded, reaches);
    ++tally.messages;
    _watch->wasTooShort = false;
    try {
        _generator->updateState(_state, message);
        if (reaches)
            ++(_watch->wasTooShort ? tally.tooShort : tally.decoded);
        // The generator of IFX keeps the tree that it has received.
        if (_technology == kVoxLogChannelTechnology_IFX)
            decoded.time = timeOf(_state.at(StateKey::kDisplayState));
    } catch (const std::exception& failure) {
        if (reaches)
            ++tally.refused;
        _log->write(Priority::Error, failure.what());
    }
    _inInterval += message.size();
    if (_inInterval >= kInterval)
        endInterval();
    addPosition(decoded);
    if (_then)
        _then(decoded);
}

// A record of a position belongs to no technology, so no generator gets it.
bool Decoding::takePosition(Bytes message)
{
    const auto read = ChannelMessage::read(message);
    if (!read || read->logCode != kPositionRecord)
        return false;
    const auto payload = read->record.from(ChannelMessage::kHeaderSize);
    const Value node = payload ? _lists.parse(payload->bytes()) : Value();
    _position = positionIn(node);
    _positionTime = timeOf(*read);
    Tally& tally = _statistics[kPositionRecord];
    ++tally.messages;
    ++(node.borrowedDictionary() != nullptr ? tally.decoded : tally.refused);
    if (_then)
        _then({_positionTime, kPositionRecord, _position});
    return true;
}

void Decoding::addPosition(Decoded& decoded) const
{
    if (!decoded.code) {
        const Value tree = _state.at(StateKey::kDisplayState);
        const auto* root = tree.borrowedDictionary();
        if (const auto* node = root != nullptr ? std::as_const(*root).find(kPositionNode) : nullptr) {
            decoded.position = positionIn(*node);
            return;
        }
    }
    if (!_position || !_positionTime || !decoded.time)
        return;
    const auto age = *decoded.time - *_positionTime;
    if (std::chrono::abs(age) < kLongestPositionAge)
        decoded.position = _position;
}

// Counts messages that reach no decoder.
Tally& Decoding::classified(Bytes message, Decoded& decoded, bool& reaches)
{
    if (_technology == kVoxLogChannelTechnology_IFX) {
        reaches = true;
        return _statistics[std::nullopt];
    }
    const auto read = ChannelMessage::read(message);
    if (!read) {
        Tally& tally = _statistics[std::nullopt];
        ++tally.tooShort;
        return tally;
    }
    decoded.code = read->logCode;
    decoded.time = timeOf(*read);
    if (decoded.time)
        _quiet->moment = *decoded.time;
    Tally& tally = _statistics[read->logCode];
    if (!read->isOfKnownType() && _technology != kVoxLogChannelTechnology_Zephra_CDMA)
        ++tally.refused;
    else if (!_codes.contains(read->logCode))
        ++tally.withoutSubscriber;
    else
        reaches = true;
    return tally;
}

void Decoding::endInterval()
{
    _generator->generateLogUsingState(_state);
    _inInterval = 0;
}

} // namespace kestrum::tools
