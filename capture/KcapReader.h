#pragma once

#include "capture/CaptureReader.h"

namespace kestrum {

/// Messages of a channel capture: each behind its length, 32 bits, little-endian. Where the lengths lead from one
/// message to the next, they alone decide, whatever the messages hold.
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
    /// Perhaps: its length is possible. Yes: its contents agree with its length.
    enum class Sound { No, Incomplete, Perhaps, Yes };
    struct Look {
        Sound sound;
        std::size_t size; ///< with the length before it
    };
    /// What stands `at` bytes into the window.
    Look look(std::size_t at);
    Found found(const Look& look);
    bool leadsOn(std::size_t at);
    /// Yes: what stands at `at` is very unlikely to be an accident. Incomplete: its missing rest would have to decide.
    Sound proof(std::size_t at);

    std::uint64_t _followedTo = 0; ///< in the stream: as far as the lengths were followed ahead
    bool _leadsOn = false;         ///< what was found there
};

} // namespace kestrum
