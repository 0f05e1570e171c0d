#pragma once

#include "tools/ByteWindow.h"

#include <cstdint>
#include <functional>
#include <optional>
#include <string>

namespace kestrum {

/// Bytes that are no message, or a message that was not quite in order.
struct Fault {
    std::uint64_t offset;
    std::uint64_t size; ///< of what was skipped; 0: nothing was lost
    std::string reason;
};

/// Finds the channel messages in a stream of bytes, whatever its length. Where the stream is damaged it looks for the
/// next message, in time and memory that do not grow with what it skips, and tells what lies between.
class MessageScanner {
public:
    using Tell = std::function<void(const Fault&)>;

    /// The window outlives the scanner.
    MessageScanner(ByteWindow& window, Tell tell) : _window(window), _tell(std::move(tell)) {}
    virtual ~MessageScanner() = default;
    MessageScanner(const MessageScanner&) = delete;
    MessageScanner& operator=(const MessageScanner&) = delete;

    /// The next message, valid until the next call; nothing at the end. While the input may still grow, a message
    /// that is not yet complete waits for its rest.
    std::optional<Bytes> next(bool mayGrow = false);
    /// Where the message that `next` gave begins.
    std::uint64_t offset() const { return _messageOffset; }
    /// How many messages the recording's notes say to be missing, up to there.
    std::uint64_t missing() const { return _missing; }

protected:
    struct Candidate {
        std::size_t size = 0;                  ///< of the message as it stands in the stream; 0: there is none
        bool incomplete = false;               ///< none yet: the stream ends before the message does
        std::string reason = {};               ///< why there is none; of a message: what was wrong with it all the same
        std::optional<std::uint64_t> gap = {}; ///< no message, but a note: so many are missing here
    };
    /// The message at the window's beginning, where one is due.
    virtual Candidate due() = 0;
    /// The message at the window's beginning, where anything may stand: only what cannot well be an accident.
    virtual Candidate chanced() = 0;
    /// The channel message in the first `size` bytes of the window.
    virtual Bytes message(std::size_t size) = 0;

    /// Whether what ends may only not have been written yet.
    bool mayGrow() const { return _mayGrow; }

    ByteWindow& _window;

private:
    Bytes take(std::size_t size, const std::string& flaw);
    void tellSkipped();

    Tell _tell;
    bool _mayGrow = false;
    std::size_t _taken = 0; ///< still in the window, since it was handed out
    std::uint64_t _messageOffset = 0, _missing = 0;
    std::optional<Fault> _skipping;
};

} // namespace kestrum
