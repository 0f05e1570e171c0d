#pragma once

#include "capture/CaptureReader.h"

namespace kestrum {

/// Reads a channel capture: a length (32 bits, little-endian) before each message. Lengths that lead to the end of the
/// capture are true; the contents of the messages do not matter then.
class KcapReader final : public CaptureReader {
public:
    KcapReader(ByteWindow& window, OnDamage onDamage, OnFault onFault)
        : CaptureReader(window, onDamage, std::move(onFault))
    {}

protected:
    Found byLength() override;
    Found inOrder() override;
    Found behindDamage() override;
    Bytes message(std::size_t size) override;

private:
    /// Perhaps: the length is possible. Yes: the contents agree with the length.
    enum class Sound { No, Incomplete, Perhaps, Yes };
    struct Look {
        Sound sound;
        std::size_t size; ///< the message and the length before it
    };
    /// Checks the message at offset `at` of the window.
    Look look(std::size_t at);
    Found found(const Look& look);
    bool leadsOn(std::size_t at);
    /// Yes: the bytes at `at` are very unlikely to look like a message by accident. Incomplete: more bytes are needed.
    Sound proof(std::size_t at);

    std::uint64_t _followedTo = 0; ///< offset in the stream up to which the lengths were followed
    bool _leadsOn = false;         ///< the result there
};

} // namespace kestrum
