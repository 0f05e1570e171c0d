#include "tools/RecordScanner.h"

#include "platform/ChannelMessage.h"
#include "support/Format.h"
#include "voxd/capture/Capture.h"

#include <algorithm>
#include <utility>

namespace kestrum {
namespace {

constexpr std::size_t kHead = 12;    // length, log code, time stamp
constexpr std::size_t kBeyond = 256; // how far behind its said end a record may really end
constexpr std::size_t kMostLead = 3;
constexpr LogCode kMostExtraCode = 0xFF;
constexpr std::byte kOrdinary{ChannelMessage::kOrdinary}, kExtraCode{ChannelMessage::kExtraCode};

// Time stamps in counts of 1.25 ms since 1980.
constexpr unsigned kSubdivisionBits = 16;
constexpr std::uint64_t kDay = 86'400 * 800ull, kYear = 365 * kDay;
constexpr std::uint64_t kEarliest = 10 * kYear, kLatest = 100 * kYear;

// Some records bear no stamp: 0 fits anything.
bool isPlausible(std::uint64_t stamp)
{
    const auto count = stamp >> kSubdivisionBits;
    return stamp == 0 || (count > kEarliest && count < kLatest);
}

bool isNear(std::uint64_t left, std::uint64_t right)
{
    const auto [early, late] = std::minmax({left >> kSubdivisionBits, right >> kSubdivisionBits});
    return left == 0 || right == 0 || late - early <= kDay;
}

} // namespace

// In the order in which they are tried: whole ones first. A lead of 2 bytes is a prefix without its marker.
const RecordScanner::Lead RecordScanner::kLeads[] = {
    {1, true, false}, {3, true, false}, {0, false, false}, {2, false, false}, {1, true, true}};

std::optional<RecordScanner::Head> RecordScanner::headAt(std::size_t at, const Lead& lead)
{
    if (_origin == Origin::Interval && !lead.isInterval)
        return std::nullopt;
    const Bytes all = _window.peek(at + kMostLead + kHead);
    const auto whole = Record(all).slice(at, lead.size + kHead);
    if (!whole)
        return std::nullopt;
    if (lead.size == kMostLead && whole->bytes().front() != ChannelMessage::kPrefixMarker)
        return std::nullopt;
    if (lead.size != 0 && !lead.anyType) {
        const auto type = whole->bytes()[lead.size - 1];
        if (type != kOrdinary && type != kExtraCode)
            return std::nullopt;
    }
    const Record record = *whole->from(lead.size);
    const std::size_t length = record.read(u16(0)).value_or(0);
    const std::uint64_t stamp = std::uint64_t{record.read(u32(8)).value_or(0)} << 32 | record.read(u32(4)).value_or(0);
    if (length < kHead || !isPlausible(stamp) || (lead.anyType && (stamp == 0 || !isNear(stamp, _lastStamp))))
        return std::nullopt;
    return Head{&lead, length, record.read(u16(2)).value_or(0), stamp};
}

RecordScanner::Next RecordScanner::whatFollows(std::size_t at, std::uint64_t stamp, int links)
{
    const std::size_t there = _window.peek(at + kHead).size();
    if (there <= at)
        return Next::End;
    if (there - at < kHead)
        return _origin == Origin::Dlf ? Next::End : Next::Nothing;
    for (const auto& lead : kLeads) {
        const auto head = headAt(at, lead);
        if (!head)
            continue;
        if (isNear(head->stamp, stamp))
            return Next::Record;
        // Time may jump, where a log was interrupted; then it goes on from there.
        const std::size_t end = at + lead.size + head->length;
        if (links > 0 && _window.peek(end).size() >= end && whatFollows(end, head->stamp, links - 1) != Next::Nothing)
            return Next::Record;
    }
    return Next::Nothing;
}

// A property list may be longer than 16 bits can count.
std::size_t RecordScanner::endOfPropertyList(std::size_t at)
{
    constexpr std::string_view kBegin = "<?xml", kEnd = "</plist>";
    if (!textOf(_window.peek(at + kBegin.size())).substr(std::min(at, _window.peek(at).size())).starts_with(kBegin))
        return 0;
    const auto all =
        textOf(_window.peek(at + CaptureReader::kMaximumMessage)).substr(0, at + CaptureReader::kMaximumMessage);
    auto end = all.find(kEnd, at);
    if (end == all.npos)
        return 0;
    end += kEnd.size();
    return end < all.size() && all[end] == '\n' ? end + 1 : end;
}

RecordScanner::Look RecordScanner::look(std::size_t at, bool chance)
{
    Look found;
    for (const auto& lead : kLeads) {
        const auto head = headAt(at, lead);
        if (!head || (chance && lead.anyType))
            continue;
        const auto fits = [&](std::size_t end) {
            if (end - at < lead.size + kHead || _window.peek(end).size() < end)
                return false;
            const auto next = whatFollows(end, head->stamp != 0 ? head->stamp : _lastStamp, 1);
            return next == Next::Record || (next == Next::End && (!chance || isNear(head->stamp, _lastStamp)));
        };
        const std::size_t end = at + lead.size + head->length;
        std::size_t fitting = fits(end) ? end : 0;
        // Some senders count the type byte.
        if (fitting == 0 && lead.size != 0 && fits(end - 1))
            fitting = end - 1;
        if (fitting == 0 && !chance && head->code <= kMostExtraCode)
            if (const auto last = endOfPropertyList(at + lead.size + kHead); last != 0 && fits(last))
                fitting = last;
        if (fitting != 0)
            return {fitting - at, false, head};
        found.incomplete |= _window.peek(end).size() < end;
        if (!found.head && isNear(head->stamp, _lastStamp))
            found.head = head;
    }
    return found;
}

MessageScanner::Candidate RecordScanner::due()
{
    const auto found = look(0, false);
    if (found.size != 0 || found.head)
        _accepted = found.head;
    if (found.size != 0)
        return {.size = found.size};
    if (!found.head)
        return {.incomplete = found.incomplete || _window.peek(kMostLead + kHead).size() < kMostLead + kHead,
                .reason = "no record begins here"};

    // What it says of its length is not true when the next record begins elsewhere.
    const std::size_t said = found.head->lead->size + found.head->length;
    const std::size_t there = std::min(_window.peek(said + kBeyond).size(), said + kBeyond);
    for (std::size_t at = found.head->lead->size + kHead; at < there; ++at)
        if (look(at, true).size != 0)
            return {.size = at, .reason = formatted("the record says that it is %lu bytes long, and is %lu", said, at)};
    if (said <= there)
        return {.size = said};
    if (_origin == Origin::Interval)
        return {.size = there,
                .reason = formatted("the record says that it is %lu bytes long, and is %lu", said, there)};
    return {.incomplete = true, .reason = formatted("the last record ends %lu bytes short", said - there)};
}

MessageScanner::Candidate RecordScanner::chanced()
{
    const auto found = look(0, true);
    if (found.size != 0)
        _accepted = found.head;
    return {.size = found.size, .incomplete = _window.peek(kMostLead + kHead).size() < kMostLead + kHead};
}

Bytes RecordScanner::message(std::size_t size)
{
    const Bytes whole = _window.peek(size).first(size);
    const Head& head = *_accepted;
    if (head.stamp != 0)
        _lastStamp = head.stamp;
    if (head.lead->isInterval)
        return whole;
    const bool isList = head.code <= kMostExtraCode && isPropertyList(whole.subspan(std::min(size, kHead)));
    _message.assign(1, head.lead->size != 0 ? ChannelMessage::kPrefixMarker : isList ? kExtraCode : kOrdinary);
    _message.insert(_message.end(), whole.begin(), whole.end());
    return _message;
}

} // namespace kestrum
