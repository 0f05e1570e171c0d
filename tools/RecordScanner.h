#pragma once

#include "tools/MessageScanner.h"

#include <vector>

namespace kestrum {

/// Log records one behind the other: length, log code, time stamp, payload. Before them stands what the stream's
/// origin left there.
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
    std::uint64_t _lastStamp = 0;
    std::optional<Head> _accepted;
    std::vector<std::byte> _message;
};

} // namespace kestrum
