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

// How far lengths are followed ahead, and how far a record is looked for that time stamps prove: two of the longest.
constexpr std::size_t kLookAhead = 1 << 20, kSearch = 128 << 10;

// Time stamps in counts of 1.25 ms since 1980.
constexpr unsigned kSubdivisionBits = 16;
constexpr std::uint64_t kDay = 86'400 * 800ull, kYear = 365 * kDay;
constexpr std::uint64_t kEarliest = 10 * kYear, kLatest = 100 * kYear;

bool isLikely(std::uint64_t stamp)
{
    const auto count = stamp >> kSubdivisionBits;
    return count > kEarliest && count < kLatest;
}

// Some records bear no stamp: 0 fits anything.
bool isNear(std::uint64_t left, std::uint64_t right)
{
    const auto [early, late] = std::minmax({left >> kSubdivisionBits, right >> kSubdivisionBits});
    return left == 0 || right == 0 || late - early <= kDay;
}

} // namespace

// In the order in which they are tried: whole ones first. A lead of 2 bytes is a prefix without its marker.
const RecordScanner::Lead RecordScanner::kLeads[] = {
    {1, true, false}, {3, true, false}, {0, false, false}, {2, false, false}, {1, true, true}};
constexpr std::size_t kPrefixed = 1, kPlain = 2, kOfAnyType = 4;

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
    if (length < kHead)
        return std::nullopt;
    return Head{&lead, length, record.read(u16(2)).value_or(0), stamp};
}

// The record at `at` of a stream in which nothing but whole records stand, as its origin lays them down.
std::optional<RecordScanner::Head> RecordScanner::framed(std::size_t at)
{
    const Bytes all = _window.peek(at + 1);
    if (all.size() <= at)
        return std::nullopt;
    const bool isPrefixed = all[at] == ChannelMessage::kPrefixMarker;
    const auto head = headAt(at, kLeads[_origin == Origin::Dlf ? kPlain : isPrefixed ? kPrefixed : kOfAnyType]);
    const std::size_t end = head ? at + head->lead->size + head->length : 0;
    return head && _window.peek(end).size() >= end ? head : std::nullopt;
}

// Each place leads to one next place: behind one that is known to lead nowhere nothing has to be followed again.
RecordScanner::Chain RecordScanner::follow()
{
    const auto offset = _window.offset();
    _broken.erase(_broken.begin(), _broken.lower_bound(offset));
    _way.clear();
    for (std::size_t at = 0; at <= kLookAhead;) {
        const std::size_t there = _window.peek(at + kMostLead + kHead).size();
        if (there <= at)
            return Chain::Ends;
        const auto head = _broken.contains(offset + at) ? std::nullopt : framed(at);
        if (!head && mayGrow() && (there < at + kMostLead + kHead || headAt(at, kLeads[kPlain])))
            return Chain::Ends;
        _way.push_back(offset + at);
        if (!head) {
            _broken.insert(_way.begin(), _way.end());
            return Chain::Breaks;
        }
        at += head->lead->size + head->length;
    }
    return Chain::GoesOn;
}

// Whether the lengths decide from the window's beginning on. Those that were followed far, and have not met the end,
// decide unless time stamps prove that a record begins elsewhere.
bool RecordScanner::leadsOn(const Head& head)
{
    const auto next = framed(head.lead->size + head.length);
    if (next && head.stamp != 0 && isInTime(head.stamp) && next->stamp != 0 && isNear(head.stamp, next->stamp))
        return true;
    if (!std::ranges::binary_search(_way, _window.offset()))
        _chain = follow();
    if (_chain == Chain::GoesOn && !isContradicted(head))
        _chain = Chain::Ends;
    return _chain == Chain::Ends;
}

bool RecordScanner::isContradicted(const Head& head)
{
    if (const auto proven = look(0, true); proven.size != 0)
        return proven.size != head.lead->size + head.length;
    return isProvenAhead() && !std::ranges::binary_search(_way, _searchedTo);
}

bool RecordScanner::isProvenAhead()
{
    const auto offset = _window.offset();
    for (_searchedTo = std::max(_searchedTo, offset + 1); _searchedTo < offset + kSearch; ++_searchedTo) {
        const auto at = static_cast<std::size_t>(_searchedTo - offset);
        if (_window.peek(at + 1).size() <= at)
            return mayGrow();
        if (look(at, true).size != 0)
            return true;
    }
    return false;
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
        if (links > 0 && isLikely(head->stamp) && _window.peek(end).size() >= end &&
            whatFollows(end, head->stamp, links - 1) != Next::Nothing)
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
    // The same end serves all lists that would begin before it, and is searched for once.
    const auto offset = _window.offset();
    if (_list.from > offset + at || (_list.end == 0 ? _list.to : _list.end) <= offset + at) {
        const auto all = textOf(_window.peek(at + CaptureReader::kMaximumMessage));
        const auto found = all.find(kEnd, at);
        _list = {offset + at, found == all.npos ? 0 : offset + found + kEnd.size(), offset + all.size()};
    }
    if (_list.end == 0)
        return 0;
    const auto end = static_cast<std::size_t>(_list.end - offset);
    return textOf(_window.peek(end + 1)).substr(end).starts_with('\n') ? end + 1 : end;
}

bool RecordScanner::isInTime(std::uint64_t stamp) const
{
    return _lastStamp != 0 ? isNear(stamp, _lastStamp) : stamp == 0 || isLikely(stamp);
}

// Whether its time stamp speaks for a record that ends at `end`: of a likely year, near the last one, or, where
// none is known yet, near the next two.
bool RecordScanner::isFamiliar(const Head& head, std::size_t end)
{
    if (head.stamp == 0)
        return false;
    if (isLikely(head.stamp) || isInTime(head.stamp))
        return true;
    if (_lastStamp != 0)
        return false;
    int agreeing = 0;
    for (auto next = framed(end); next && next->stamp != 0 && isNear(next->stamp, head.stamp) && agreeing < 2;
         next = framed(end), ++agreeing)
        end += next->lead->size + next->length;
    return agreeing == 2;
}

RecordScanner::Look RecordScanner::look(std::size_t at, bool chance)
{
    Look found;
    for (const auto& lead : kLeads) {
        const auto head = headAt(at, lead);
        // By chance any two bytes stand where a prefix without its marker would.
        if (!head || (chance && !lead.isInterval && lead.size != 0) ||
            (lead.anyType && (chance || head->stamp == 0 || !isInTime(head->stamp))))
            continue;
        const auto fits = [&](std::size_t end) {
            if (end - at < lead.size + kHead || _window.peek(end).size() < end)
                return false;
            const bool mayJump = !chance || isInTime(head->stamp);
            const auto next = whatFollows(end, head->stamp != 0 ? head->stamp : _lastStamp, mayJump ? 1 : 0);
            return next == Next::Record ||
                   (next == Next::End && (!chance || (_lastStamp != 0 && isNear(head->stamp, _lastStamp))));
        };
        const std::size_t end = at + lead.size + head->length;
        if (chance && !isFamiliar(*head, end))
            continue;
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
        if (!found.head && isInTime(head->stamp))
            found.head = head;
    }
    return found;
}

MessageScanner::Candidate RecordScanner::accept(const Head& head, std::size_t size)
{
    _accepted = head;
    return {.size = size};
}

MessageScanner::Candidate RecordScanner::due()
{
    const auto record = framed(0);
    const std::size_t size = record ? record->lead->size + record->length : 0;
    if (record && leadsOn(*record))
        return accept(*record, size);
    const auto found = look(0, false);
    if (found.size != 0)
        return accept(*found.head, found.size);
    // Damage is ahead: this record is whole unless it hides another one.
    if (!found.head && record && !isContradicted(*record))
        return accept(*record, size);
    if (!found.head)
        return {.incomplete = found.incomplete || _window.peek(kMostLead + kHead).size() < kMostLead + kHead,
                .reason = "no record begins here"};

    _accepted = found.head;
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
    if (const auto found = look(0, true); found.size != 0)
        return accept(*found.head, found.size);
    // Where no stamps help, the lengths have to lead on from here, and not at once to the end by accident.
    if (const auto record = framed(0); record && !isProvenAhead() && follow() != Chain::Breaks && _way.size() > 1)
        return accept(*record, record->lead->size + record->length);
    return {.incomplete = _window.peek(kMostLead + kHead).size() < kMostLead + kHead};
}

Bytes RecordScanner::message(std::size_t size)
{
    const Bytes whole = _window.peek(size).first(size);
    const Head& head = *_accepted;
    if (head.stamp != 0 && _lastStamp == 0)
        _searchedTo = 0;
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
