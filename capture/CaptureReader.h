#pragma once

#include "capture/ByteWindow.h"
#include "capture/CaptureFormat.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>

namespace kestrum {

/// Bytes of a capture that are no message, or a message that has a flaw.
struct CaptureFault {
    std::uint64_t offset;
    std::uint64_t size; ///< bytes skipped; 0: none
    std::string reason;
};

/// What a reader does where a capture is damaged.
enum class OnDamage {
    Stop,  ///< Messages are taken by their lengths alone, up to the first length that cannot be true.
    Search ///< The next message is searched for; what lies between is reported as skipped.
};

/// Reads the channel messages of a capture of any length, in time and memory that do not grow with what it skips.
class CaptureReader {
public:
    using OnFault = std::function<void(const CaptureFault&)>;

    virtual ~CaptureReader() = default;
    CaptureReader(const CaptureReader&) = delete;
    CaptureReader& operator=(const CaptureReader&) = delete;

    /// The window outlives the reader.
    static std::unique_ptr<CaptureReader> make(CaptureFormat format, ByteWindow& window, OnDamage onDamage,
                                               OnFault onFault);

    /// The next message, valid until the next call, with the window at its beginning; nothing at the end, and where reading stops at damage. While the
    /// input may still grow, a message that is not yet complete is waited for.
    std::optional<Bytes> next(bool mayGrow = false);
    /// How many messages are missing so far, as the capture's notes say.
    std::uint64_t missing() const { return _missing; }

protected:
    CaptureReader(ByteWindow& window, OnDamage onDamage, OnFault onFault)
        : _window(window), _onDamage(onDamage), _onFault(std::move(onFault))
    {}

    /// What stands at the window's beginning.
    struct Found {
        std::size_t size = 0;                  ///< of the message with what frames it; 0: no message
        bool incomplete = false;               ///< no message yet: the stream ends before the message does
        std::string reason = {};               ///< why there is none; of a message: its flaw
        std::optional<std::uint64_t> gap = {}; ///< not a message but a note that this many are missing here
    };
    /// By the length alone.
    virtual Found byLength() = 0;
    /// Behind a message, where the next one should begin: by the length, unless the bytes behind it contradict it.
    virtual Found inOrder() = 0;
    /// Behind damage, where anything may stand: only what is very unlikely to be an accident.
    virtual Found behindDamage() = 0;
    /// The channel message in the first `size` bytes of the window.
    virtual Bytes message(std::size_t size) = 0;

    /// Whether the stream's end may not be written yet.
    bool mayGrow() const { return _mayGrow; }

    ByteWindow& _window;

private:
    Found find();
    Bytes take(std::size_t size, const std::string& flaw);
    void reportSkipped();

    const OnDamage _onDamage;
    OnFault _onFault;
    bool _mayGrow = false, _hasStopped = false;
    std::size_t _given = 0; ///< bytes of the message given last, which are still in the window
    std::uint64_t _missing = 0;
    std::optional<CaptureFault> _skipping;
};

} // namespace kestrum
