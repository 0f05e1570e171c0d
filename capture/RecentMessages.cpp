#include "capture/RecentMessages.h"

namespace kestrum {

template <typename Write>
void RecentMessages::append(Write write)
{
    if (_pieces.empty() || _pieces.back().turn != _turn || _pieces.back().text.size() >= kPiece) {
        if (!_pieces.empty()) { // it does not grow any more
            auto& last = _pieces.back().text;
            _bytes -= last.capacity();
            last.shrink_to_fit();
            _bytes += last.capacity();
        }
        _pieces.push_back({_turn, {}});
        _bytes += _pieces.back().text.capacity();
    }
    auto& text = _pieces.back().text;
    _bytes -= text.capacity();
    write([&text](Bytes bytes) { text += textOf(bytes); });
    _bytes += text.capacity();
    keepLimits();
}

void RecentMessages::add(Bytes message)
{
    append([&](const ByteSink& to) { writeKcap(to, message); });
}

void RecentMessages::addGap(std::uint64_t messages)
{
    append([&](const ByteSink& to) { writeKcapGap(to, messages); });
}

void RecentMessages::turn()
{
    ++_turn;
    keepLimits();
}

void RecentMessages::keepLimits()
{
    while (!_pieces.empty() && (_bytes > _limits.bytes || _pieces.front().turn + _limits.turns <= _turn)) {
        _bytes -= _pieces.front().text.capacity();
        _pieces.pop_front();
    }
}

void RecentMessages::clear()
{
    _pieces.clear();
    _bytes = 0;
}

void RecentMessages::writeTo(const ByteSink& to) const
{
    for (const auto& piece : _pieces)
        to(bytesOf(piece.text));
}

} // namespace kestrum
