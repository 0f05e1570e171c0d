#pragma once

#include "tools/MessageScanner.h"

namespace kestrum {

/// Messages of a channel capture: each behind its length, 32 bits, little-endian.
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
    bool isFollowed(std::size_t at, int links);
};

} // namespace kestrum
