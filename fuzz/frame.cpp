// The byte stream of a message port. Any division into pieces gives the same frames, up to the same fault. The
// frames, written again, are the input.
#include "platform/posix/Frame.h"
#include "Require.h"

#include <algorithm>
#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

namespace kestrum::fuzz {
namespace {

struct Outcome {
    std::vector<std::byte> written; ///< the frames, written again
    std::string fault;

    bool operator==(const Outcome&) const = default;
};

/// `piece`: the number of bytes that arrive at once.
Outcome readInPieces(Bytes stream, std::size_t piece)
{
    FrameReader reader;
    Outcome outcome;
    for (std::size_t at = 0; at < stream.size() && outcome.fault.empty();) {
        const Bytes next = stream.subspan(at, std::min(piece, stream.size() - at));
        const auto room = reader.room(next.size());
        require(room.size() >= next.size(), "less room than was asked for");
        std::memcpy(room.data(), next.data(), next.size());
        reader.filled(next.size());
        at += next.size();
        while (const auto frame = reader.next())
            appendFrame(outcome.written, *frame);
        outcome.fault = reader.fault();
    }
    return outcome;
}

void read(Bytes input)
{
    if (input.empty())
        return;
    const Bytes stream = input.subspan(1);
    const auto whole = readInPieces(stream, std::max<std::size_t>(stream.size(), 1));
    require(whole == readInPieces(stream, std::to_integer<std::size_t>(input.front()) + 1),
            "other pieces, other frames");
    require(whole.written.size() <= stream.size() &&
                std::ranges::equal(whole.written, stream.first(whole.written.size())),
            "the frames are not what was sent");
}

} // namespace
} // namespace kestrum::fuzz

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
    kestrum::fuzz::read(std::as_bytes(std::span(data, size)));
    return 0;
}
