#pragma once

#include "tools/MessageScanner.h"

#include <set>
#include <vector>

namespace kestrum {

/// Log records one behind the other: length, log code, time stamp, payload. Before them stands what the stream's
/// origin left there. Where the lengths lead from record to record up to the end, they alone decide; time stamps help
/// where they do not: a modem that has not heard of the time yet counts from 1980, and any stamp may be wrong.
class RecordScanner final : public MessageScanner {
public:
    enum class Origin {
        /// A DLF stream. A record may begin with its length, or with what the log channel puts before it (type byte,
        /// prefix): the streams of snapshots hold both, as they leave out the first byte of each refresh interval.
        Dlf,
        /// The channel messages of a refresh interval, complete. What is there is all that there was.
        Interval,
    };

    RecordScanner(ByteWindow& window, Tell tell, Origin origin)
        : MessageScanner(window, std::move(tell)), _origin(origin)
    {}

protected:
    Candidate due() override;
    Candidate chanced() override;
    Bytes message(std::size_t size) override;

private:
    /// What stands before the length.
    struct Lead {
        std::size_t size;
        bool isInterval; ///< it stands so in an interval
        bool anyType;    ///< the type byte need not be a known one
    };
    static const Lead kLeads[];

    struct Head {
        const Lead* lead;
        std::size_t length; ///< as it says itself, 12 bytes of header included
        std::uint32_t code;
        std::uint64_t stamp;
    };
    std::optional<Head> headAt(std::size_t at, const Lead& lead);
    std::optional<Head> framed(std::size_t at);
    /// Where the lengths lead: to the end of the stream, on and on, or to one that cannot be.
    enum class Chain { Ends, GoesOn, Breaks };
    Chain follow();
    bool leadsOn(const Head& head);
    bool isContradicted(const Head& head);
    bool isProvenAhead();
    Candidate accept(const Head& head, std::size_t size);
    bool isInTime(std::uint64_t stamp) const;
    bool isFamiliar(const Head& head, std::size_t end);

    enum class Next { Nothing, End, Record };
    Next whatFollows(std::size_t at, std::uint64_t stamp, int links);
    /// The record at `at`: its size when something follows it that may; else the best that was found of its head.
    struct Look {
        std::size_t size = 0;
        bool incomplete = false;
        std::optional<Head> head = {};
    };
    Look look(std::size_t at, bool chance);
    std::size_t endOfPropertyList(std::size_t at);

    Origin _origin;
    // Offsets in the stream. What was found is kept, so that no part of it is gone through for each record again.
    std::vector<std::uint64_t> _way; ///< the records that were followed last
    Chain _chain = Chain::Breaks;    ///< where they lead
    std::set<std::uint64_t> _broken; ///< where lengths begin that lead to one that cannot be
    std::uint64_t _searchedTo = 0;   ///< up to here stamps prove no record, and there they do, or nothing was looked at
    struct {
        std::uint64_t from = 0, end = 0; ///< the first end of a list behind `from`; 0: none before `to`
        std::uint64_t to = 0;
    } _list;
    std::uint64_t _lastStamp = 0;
    std::optional<Head> _accepted;
    std::vector<std::byte> _message;
};

} // namespace kestrum
