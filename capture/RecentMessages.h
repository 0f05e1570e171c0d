#pragma once

#include "capture/CaptureWriter.h"
#include "support/Bytes.h"

#include <cstddef>
#include <cstdint>
#include <deque>
#include <string>

namespace kestrum {

/// The latest messages of a log, in the form of a channel capture. Bounded by turns, which its owner counts, and by
/// bytes: the oldest messages go first.
class RecentMessages {
public:
    struct Limits {
        std::uint64_t turns = 450;    ///< 15 minutes of refreshes, every 2 s
        std::size_t bytes = 48 << 20; ///< in memory: more than an ordinary modem sends in that time
    };

    RecentMessages() = default;
    explicit RecentMessages(Limits limits) : _limits(limits) {}

    void add(Bytes message);
    /// Notes that `messages` messages are missing here.
    void addGap(std::uint64_t messages);
    /// Begins a new turn. The messages of the last `Limits::turns` turns stay.
    void turn();
    void clear();

    bool isEmpty() const { return _pieces.empty(); }
    /// The memory of the messages.
    std::size_t bytes() const { return _bytes; }
    /// Writes a channel capture.
    void writeTo(const ByteSink& to) const;

private:
    /// Messages go piece by piece: of one turn, and not much longer than `kPiece`.
    static constexpr std::size_t kPiece = 256 << 10;
    struct Piece {
        std::uint64_t turn;
        std::string text;
    };

    template <typename Write>
    void append(Write write);
    void keepLimits();

    Limits _limits;
    std::deque<Piece> _pieces;
    std::uint64_t _turn = 0;
    std::size_t _bytes = 0;
};

} // namespace kestrum
