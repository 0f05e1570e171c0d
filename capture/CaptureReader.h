#pragma once

#include "capture/ByteWindow.h"
#include "capture/CaptureFormat.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>

namespace kestrum {

/// Bytes of a capture that are no message, or a message with a flaw.
struct CaptureFault {
    std::uint64_t offset;
    std::uint64_t size; ///< bytes skipped; 0 for a message with a flaw
    std::string reason;
};

/// What a reader does at damage.
enum class OnDamage {
    Stop,  ///< Reads messages by their lengths only, and ends at the first impossible length.
    Search ///< Searches for the next message, and reports the bytes before it as skipped.
};

/// Reads the channel messages of a capture of any size. Memory does not grow with the number of skipped bytes.
class CaptureReader {
public:
    using OnFault = std::function<void(const CaptureFault&)>;

    virtual ~CaptureReader() = default;
    CaptureReader(const CaptureReader&) = delete;
    CaptureReader& operator=(const CaptureReader&) = delete;

    /// The window outlives the reader.
    static std::unique_ptr<CaptureReader> make(CaptureFormat format, ByteWindow& window, OnDamage onDamage,
                                               OnFault onFault);

    /// The next message, valid until the next call; the window is then at its beginning. Nothing at the end, or when
    /// reading stops at damage. With `mayGrow`, nothing also for an incomplete message, which is read again later.
    std::optional<Bytes> next(bool mayGrow = false);
    /// The number of missing messages by the capture's notes so far.
    std::uint64_t missing() const { return _missing; }

protected:
    CaptureReader(ByteWindow& window, OnDamage onDamage, OnFault onFault)
        : _window(window), _onDamage(onDamage), _onFault(std::move(onFault))
    {}

    /// A message, or no message, at the window's beginning.
    struct Found {
        std::size_t size = 0;                  ///< bytes of the message and its framing; 0: no message
        bool incomplete = false;               ///< no message yet: the stream ends before its end
        std::string reason = {};               ///< why there is no message; or the message's flaw
        std::optional<std::uint64_t> gap = {}; ///< a note instead of a message: this many messages are missing
    };
    /// Finds a message by its length only.
    virtual Found byLength() = 0;
    /// Finds a message directly after another one: by its length, unless the following bytes contradict it.
    virtual Found inOrder() = 0;
    /// Finds a message after damage: accepts only bytes that are very unlikely to look like a message by accident.
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
    std::size_t _given = 0; ///< bytes of the last returned message, still in the window
    std::uint64_t _missing = 0;
    std::optional<CaptureFault> _skipping;
};

} // namespace kestrum
