#pragma once

#include "capture/CaptureReader.h"

#include <set>
#include <vector>

namespace kestrum {

/// Reads log records (length, log code, time stamp, payload) that follow one another. Lengths that lead to the end are
/// true; otherwise time stamps help. A time stamp is only a hint: a modem without network time counts from 1980, and
/// any stamp may be wrong.
class RecordReader final : public CaptureReader {
public:
    enum class Origin {
        /// A DLF stream. A record may begin with its length, or with what the log channel puts before it (type byte,
        /// prefix): the streams of snapshots hold both, as they leave out the first byte of each refresh interval.
        Dlf,
        /// The channel messages of a refresh interval, complete.
        Interval,
    };

    RecordReader(ByteWindow& window, OnDamage onDamage, OnFault onFault, Origin origin = Origin::Dlf)
        : CaptureReader(window, onDamage, std::move(onFault)), _origin(origin)
    {}

protected:
    Found byLength() override;
    Found inOrder() override;
    Found behindDamage() override;
    Bytes message(std::size_t size) override;

private:
    /// The bytes before the length.
    struct Preamble {
        std::size_t size;
        bool inInterval; ///< records of an interval may have it
        bool anyType;    ///< the type byte need not be a known one
    };
    static const Preamble kPreambles[];

    struct Head {
        const Preamble* preamble;
        std::size_t length; ///< from the record, 12 bytes of header included
        std::uint32_t code;
        std::uint64_t stamp;

        std::size_t size() const { return preamble->size + length; } ///< in the stream, when the length is true
    };
    std::optional<Head> headAt(std::size_t at, const Preamble& preamble);
    std::optional<Head> framed(std::size_t at);
    /// The lengths lead to the end of the stream, beyond the limit of the search, or to an impossible length.
    enum class Chain { Ends, GoesOn, Breaks };
    Chain follow();
    bool leadsOn(const Head& head);
    bool isContradicted(const Head& head);
    bool isProvenAhead();
    Found accept(const Head& head, std::size_t size);
    bool isInTime(std::uint64_t stamp) const;
    bool isFamiliar(const Head& head, std::size_t end);

    enum class Next { Nothing, End, Record };
    Next whatFollows(std::size_t at, std::uint64_t stamp, int links);
    /// The evidence for a record: the bytes after it, or these and a plausible time stamp.
    enum class Evidence { Structure, TimeStamp };
    /// The record at `at`: its size when the evidence suffices; else the most likely head.
    struct Look {
        std::size_t size = 0;
        bool incomplete = false;
        std::optional<Head> head = {};
    };
    Look look(std::size_t at, Evidence evidence);
    std::size_t endOfPropertyList(std::size_t at);

    Origin _origin;
    // Offsets in the stream. Cached results, so that no part of the stream is searched twice.
    std::vector<std::uint64_t> _way; ///< the records followed last
    Chain _chain = Chain::Breaks;    ///< where they lead
    std::set<std::uint64_t> _broken; ///< records whose lengths lead to an impossible one
    std::uint64_t _searchedTo = 0;   ///< time stamps prove no record before this place
    struct {
        std::uint64_t from = 0, end = 0; ///< the first end of a list after `from`; 0: none before `to`
        std::uint64_t to = 0;
    } _list;
    std::uint64_t _lastStamp = 0;
    std::optional<Head> _accepted;
    std::vector<std::byte> _message;
};

} // namespace kestrum
