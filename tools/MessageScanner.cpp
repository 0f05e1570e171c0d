#include "tools/MessageScanner.h"

#include <utility>

namespace kestrum {

std::optional<Bytes> MessageScanner::next(bool mayGrow)
{
    _mayGrow = mayGrow;
    _window.skip(std::exchange(_taken, 0));
    while (!_window.peek(1).empty()) {
        Candidate found = _skipping ? chanced() : due();
        if (found.gap) {
            tellSkipped();
            _missing += *found.gap;
            _window.skip(found.size);
            continue;
        }
        if (found.size != 0)
            return take(found.size, found.reason);
        if (found.incomplete && mayGrow)
            return std::nullopt;
        if (!_skipping)
            _skipping = Fault{_window.offset(), 0, std::move(found.reason)};
        _window.skip(1);
        ++_skipping->size;
    }
    if (!mayGrow)
        tellSkipped();
    return std::nullopt;
}

Bytes MessageScanner::take(std::size_t size, const std::string& flaw)
{
    tellSkipped();
    _messageOffset = _window.offset();
    if (!flaw.empty())
        _tell({_messageOffset, 0, flaw});
    _taken = size;
    return message(size);
}

void MessageScanner::tellSkipped()
{
    if (_skipping)
        _tell(*std::exchange(_skipping, std::nullopt));
}

} // namespace kestrum
