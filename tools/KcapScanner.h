#pragma once

#include "tools/MessageScanner.h"

namespace kestrum {

/// Messages of a channel capture: each behind its length, 32 bits, little-endian. Where the lengths lead from one
/// message to the next, they alone decide, whatever the messages hold.
class KcapScanner final : public MessageScanner {
public:
    using MessageScanner::MessageScanner;

protected:
    Candidate due() override;
    Candidate chanced() override;
    Bytes message(std::size_t size) override;

private:
    enum class Sound { No, Incomplete, Perhaps, Yes };
    struct Look {
        Sound sound;
        std::size_t size; ///< with the length before it
    };
    /// What stands `at` bytes into the window.
    Look look(std::size_t at);
    bool leadsOn(std::size_t at);
    Candidate found(std::size_t size);
    Sound proof(std::size_t at);

    std::uint64_t _followedTo = 0; ///< in the stream: as far as the lengths were followed ahead
    bool _leadsOn = false;         ///< what was found there
};

} // namespace kestrum
