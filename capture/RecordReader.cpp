#include "capture/RecordReader.h"

#include "platform/ChannelMessage.h"
#include "support/Format.h"

#include <algorithm>
#include <utility>

namespace kestrum {
namespace {

constexpr std::size_t kRecordHead = 12; // length, log code, time stamp
constexpr std::size_t kBeyond = 256;    // bytes that a record may be longer than its length
constexpr std::size_t kLongestPreamble = 3;
constexpr LogCode kMostExtraCode = 0xFF;
constexpr std::byte kOrdinary{ChannelMessage::kOrdinary}, kExtraCode{ChannelMessage::kExtraCode};

// How far lengths are followed; and how far a record proven by time stamps is searched (twice the longest record).
constexpr std::size_t kRecordLookAhead = 1 << 20, kSearch = 128 << 10;

// Time stamps in counts of 1.25 ms since 1980.
constexpr unsigned kSubdivisionBits = 16;
constexpr std::uint64_t kDay = 86'400 * 800ull, kYear = 365 * kDay;
constexpr std::uint64_t kEarliest = 10 * kYear, kLatest = 100 * kYear;

bool isLikely(std::uint64_t stamp)
{
    const auto count = stamp >> kSubdivisionBits;
    return count > kEarliest && count < kLatest;
}

// A stamp of 0 means none and agrees with every other.
bool isNear(std::uint64_t left, std::uint64_t right)
{
    const auto [early, late] = std::minmax({left >> kSubdivisionBits, right >> kSubdivisionBits});
    return left == 0 || right == 0 || late - early <= kDay;
}

} // namespace

// In the order of the tries: complete ones first. A preamble of 2 bytes is a prefix without its marker.
const RecordReader::Preamble RecordReader::kPreambles[] = {
    {1, true, false}, {3, true, false}, {0, false, false}, {2, false, false}, {1, true, true}};
constexpr std::size_t kPrefixAndType = 1, kNoPreamble = 2, kAnyType = 4;

std::optional<RecordReader::Head> RecordReader::headAt(std::size_t at, const Preamble& preamble)
{
    if (_origin == Origin::Interval && !preamble.inInterval)
        return std::nullopt;
    const Bytes all = _window.peek(at + kLongestPreamble + kRecordHead);
    const auto whole = Record(all).slice(at, preamble.size + kRecordHead);
    if (!whole)
        return std::nullopt;
    if (preamble.size == kLongestPreamble && whole->bytes().front() != ChannelMessage::kPrefixMarker)
        return std::nullopt;
    if (preamble.size != 0 && !preamble.anyType) {
        const auto type = whole->bytes()[preamble.size - 1];
        if (type != kOrdinary && type != kExtraCode)
            return std::nullopt;
    }
    const Record record = *whole->from(preamble.size);
    const std::size_t length = record.read(u16(0)).value_or(0);
    const std::uint64_t stamp = record.read64(4).value_or(0);
    if (length < kRecordHead)
        return std::nullopt;
    return Head{&preamble, length, record.read(u16(2)).value_or(0), stamp};
}

// The record at `at` of an undamaged stream: complete, with the preamble that this origin has there.
std::optional<RecordReader::Head> RecordReader::framed(std::size_t at)
{
    const Bytes all = _window.peek(at + 1);
    if (all.size() <= at)
        return std::nullopt;
    const bool isPrefixed = all[at] == ChannelMessage::kPrefixMarker;
    const auto usual = _origin == Origin::Dlf ? kNoPreamble : isPrefixed ? kPrefixAndType : kAnyType;
    const auto head = headAt(at, kPreambles[usual]);
    const std::size_t end = head ? at + head->size() : 0;
    return head && _window.peek(end).size() >= end ? head : std::nullopt;
}

// A length always leads to the same place, so records that led to an impossible length are not followed again.
RecordReader::Chain RecordReader::follow()
{
    const auto offset = _window.offset();
    _broken.erase(_broken.begin(), _broken.lower_bound(offset));
    _way.clear();
    for (std::size_t at = 0; at <= kRecordLookAhead;) {
        const std::size_t there = _window.peek(at + kLongestPreamble + kRecordHead).size();
        if (there <= at)
            return Chain::Ends;
        const auto head = _broken.contains(offset + at) ? std::nullopt : framed(at);
        if (!head && mayGrow() && (there < at + kLongestPreamble + kRecordHead || headAt(at, kPreambles[kNoPreamble])))
            return Chain::Ends;
        _way.push_back(offset + at);
        if (!head) {
            _broken.insert(_way.begin(), _way.end());
            return Chain::Breaks;
        }
        at += head->size();
    }
    return Chain::GoesOn;
}

// Whether the lengths from the window's beginning are true. Lengths that lead far without reaching the end are true
// unless time stamps prove that a record begins elsewhere.
bool RecordReader::leadsOn(const Head& head)
{
    const auto next = framed(head.size());
    if (next && head.stamp != 0 && isInTime(head.stamp) && next->stamp != 0 && isNear(head.stamp, next->stamp))
        return true;
    if (!std::ranges::binary_search(_way, _window.offset()))
        _chain = follow();
    if (_chain == Chain::GoesOn && !isContradicted(head))
        _chain = Chain::Ends;
    return _chain == Chain::Ends;
}

bool RecordReader::isContradicted(const Head& head)
{
    if (const auto proven = look(0, Evidence::TimeStamp); proven.size != 0)
        return proven.size != head.size();
    return isProvenAhead() && !std::ranges::binary_search(_way, _searchedTo);
}

bool RecordReader::isProvenAhead()
{
    const auto offset = _window.offset();
    for (_searchedTo = std::max(_searchedTo, offset + 1); _searchedTo < offset + kSearch; ++_searchedTo) {
        const auto at = static_cast<std::size_t>(_searchedTo - offset);
        if (_window.peek(at + 1).size() <= at)
            return mayGrow();
        if (look(at, Evidence::TimeStamp).size != 0)
            return true;
    }
    return false;
}

RecordReader::Next RecordReader::whatFollows(std::size_t at, std::uint64_t stamp, int links)
{
    const std::size_t there = _window.peek(at + kRecordHead).size();
    if (there <= at)
        return Next::End;
    if (there - at < kRecordHead)
        return _origin == Origin::Dlf ? Next::End : Next::Nothing;
    for (const auto& preamble : kPreambles) {
        const auto head = headAt(at, preamble);
        if (!head)
            continue;
        if (isNear(head->stamp, stamp))
            return Next::Record;
        // Time may jump where a log was interrupted. Later stamps are near the new time.
        const std::size_t end = at + preamble.size + head->length;
        if (links > 0 && isLikely(head->stamp) && _window.peek(end).size() >= end &&
            whatFollows(end, head->stamp, links - 1) != Next::Nothing)
            return Next::Record;
    }
    return Next::Nothing;
}

// A property list may be longer than 16 bits can count.
std::size_t RecordReader::endOfPropertyList(std::size_t at)
{
    constexpr std::string_view kBegin = "<?xml", kEnd = "</plist>";
    if (!textOf(_window.peek(at + kBegin.size())).substr(std::min(at, _window.peek(at).size())).starts_with(kBegin))
        return 0;
    // All lists that would begin before this end share it, so it is searched once.
    const auto offset = _window.offset();
    if (_list.from > offset + at || (_list.end == 0 ? _list.to : _list.end) <= offset + at) {
        const auto all = textOf(_window.peek(at + kLongestMessage));
        const auto found = all.find(kEnd, at);
        _list = {offset + at, found == all.npos ? 0 : offset + found + kEnd.size(), offset + all.size()};
    }
    if (_list.end == 0)
        return 0;
    const auto end = static_cast<std::size_t>(_list.end - offset);
    return textOf(_window.peek(end + 1)).substr(end).starts_with('\n') ? end + 1 : end;
}

bool RecordReader::isInTime(std::uint64_t stamp) const
{
    return _lastStamp != 0 ? isNear(stamp, _lastStamp) : stamp == 0 || isLikely(stamp);
}

// Whether the time stamp of a record that ends at `end` is plausible: in a likely year, near the last stamp, or, when
// none is known, near the next two.
bool RecordReader::isFamiliar(const Head& head, std::size_t end)
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
        end += next->size();
    return agreeing == 2;
}

RecordReader::Look RecordReader::look(std::size_t at, Evidence evidence)
{
    const bool byStamp = evidence == Evidence::TimeStamp;
    Look found;
    for (const auto& preamble : kPreambles) {
        const auto head = headAt(at, preamble);
        // Any two bytes may be a prefix without its marker.
        if (!head || (byStamp && !preamble.inInterval && preamble.size != 0) ||
            (preamble.anyType && (byStamp || head->stamp == 0 || !isInTime(head->stamp))))
            continue;
        const auto fits = [&](std::size_t end) {
            if (end - at < preamble.size + kRecordHead || _window.peek(end).size() < end)
                return false;
            const bool mayJump = !byStamp || isInTime(head->stamp);
            const auto next = whatFollows(end, head->stamp != 0 ? head->stamp : _lastStamp, mayJump ? 1 : 0);
            return next == Next::Record ||
                   (next == Next::End && (!byStamp || (_lastStamp != 0 && isNear(head->stamp, _lastStamp))));
        };
        const std::size_t end = at + preamble.size + head->length;
        if (byStamp && !isFamiliar(*head, end))
            continue;
        std::size_t fitting = fits(end) ? end : 0;
        // Some senders count the type byte.
        if (fitting == 0 && preamble.size != 0 && fits(end - 1))
            fitting = end - 1;
        if (fitting == 0 && !byStamp && head->code <= kMostExtraCode)
            if (const auto last = endOfPropertyList(at + preamble.size + kRecordHead); last != 0 && fits(last))
                fitting = last;
        if (fitting != 0)
            return {fitting - at, false, head};
        found.incomplete |= _window.peek(end).size() < end;
        if (!found.head && isInTime(head->stamp))
            found.head = head;
    }
    return found;
}

CaptureReader::Found RecordReader::accept(const Head& head, std::size_t size)
{
    _accepted = head;
    return {.size = size};
}

CaptureReader::Found RecordReader::byLength()
{
    const Record stream(_window.peek(kRecordHead));
    const auto length = stream.read(u16(0));
    if (!length)
        return {.incomplete = true, .reason = "the length has only 1 of its 2 bytes"};
    if (*length < kRecordHead)
        return {.reason = formatted("a record of %u bytes, shorter than its header of %lu", *length, kRecordHead)};
    if (const auto there = _window.peek(*length).size(); there < *length)
        return {.incomplete = true,
                .reason = formatted("the last message is cut off (%lu bytes missing)", *length - there)};
    return accept(*headAt(0, kPreambles[kNoPreamble]), *length);
}

CaptureReader::Found RecordReader::inOrder()
{
    const auto record = framed(0);
    const std::size_t size = record ? record->size() : 0;
    if (record && leadsOn(*record))
        return accept(*record, size);
    const auto found = look(0, Evidence::Structure);
    if (found.size != 0)
        return accept(*found.head, found.size);
    // Damage follows: the record is complete unless another one begins inside it.
    if (!found.head && record && !isContradicted(*record))
        return accept(*record, size);
    if (!found.head)
        return {.incomplete = found.incomplete ||
                              _window.peek(kLongestPreamble + kRecordHead).size() < kLongestPreamble + kRecordHead,
                .reason = "no record begins here"};

    _accepted = found.head;
    // The record's length is wrong when the next record begins elsewhere.
    const std::size_t said = found.head->size();
    const std::size_t there = std::min(_window.peek(said + kBeyond).size(), said + kBeyond);
    for (std::size_t at = found.head->preamble->size + kRecordHead; at < there; ++at)
        if (look(at, Evidence::TimeStamp).size != 0)
            return {.size = at,
                    .reason = formatted("the record's length field says %lu bytes, but the record has %lu", said, at)};
    if (said <= there)
        return {.size = said};
    if (_origin == Origin::Interval)
        return {.size = there,
                .reason = formatted("the record's length field says %lu bytes, but the record has %lu", said, there)};
    return {.incomplete = true, .reason = formatted("the last record is cut off (%lu bytes missing)", said - there)};
}

CaptureReader::Found RecordReader::behindDamage()
{
    if (const auto found = look(0, Evidence::TimeStamp); found.size != 0)
        return accept(*found.head, found.size);
    // Without helpful stamps, the lengths must lead on from here, and not directly to the end by accident.
    if (const auto record = framed(0); record && !isProvenAhead() && follow() != Chain::Breaks && _way.size() > 1)
        return accept(*record, record->size());
    return {.incomplete = _window.peek(kLongestPreamble + kRecordHead).size() < kLongestPreamble + kRecordHead};
}

Bytes RecordReader::message(std::size_t size)
{
    const Bytes whole = _window.peek(size).first(size);
    const Head& head = *_accepted;
    if (head.stamp != 0 && _lastStamp == 0)
        _searchedTo = 0;
    if (head.stamp != 0)
        _lastStamp = head.stamp;
    if (head.preamble->inInterval)
        return whole;
    const bool isList = head.code <= kMostExtraCode && isPropertyList(whole.subspan(std::min(size, kRecordHead)));
    _message.assign(1, head.preamble->size != 0 ? ChannelMessage::kPrefixMarker : isList ? kExtraCode : kOrdinary);
    _message.insert(_message.end(), whole.begin(), whole.end());
    return _message;
}

} // namespace kestrum
