#pragma once

#include "support/Bytes.h"

#include <cstddef>
#include <deque>
#include <optional>

namespace kestrum {

/// Messages that a client has not read yet. Beyond the capacity the oldest whole messages are dropped and counted.
class Outbox {
public:
    explicit Outbox(std::size_t capacity) : _capacity(capacity) {} ///< bytes

    void add(Data message)
    {
        _held += cost(message);
        _messages.push_back(std::move(message));
        while (_held > _capacity && !_messages.empty()) {
            _held -= cost(_messages.front());
            _messages.pop_front();
            ++_dropped;
        }
    }

    std::optional<Data> take()
    {
        if (_messages.empty())
            return std::nullopt;
        auto oldest = std::move(_messages.front());
        _messages.pop_front();
        _held -= cost(oldest);
        return oldest;
    }

    std::size_t held() const { return _held; }       ///< bytes, including the overhead of each message
    std::size_t dropped() const { return _dropped; } ///< messages since the start

private:
    static std::size_t cost(const Data& message) { return message.size() + kOverhead; }

    // Counted for each message, so that many tiny messages cannot take far more memory than their bytes.
    static constexpr std::size_t kOverhead = 64;

    std::size_t _capacity;
    std::size_t _held = 0, _dropped = 0;
    std::deque<Data> _messages;
};

} // namespace kestrum
