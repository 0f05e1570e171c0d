#include "capture/CaptureReader.h"

#include "capture/KcapReader.h"
#include "capture/RecordReader.h"

#include <utility>

namespace kestrum {

std::unique_ptr<CaptureReader> CaptureReader::make(CaptureFormat format, ByteWindow& window, OnDamage onDamage,
                                                   OnFault onFault)
{
    if (format == CaptureFormat::Kcap)
        return std::make_unique<KcapReader>(window, onDamage, std::move(onFault));
    return std::make_unique<RecordReader>(window, onDamage, std::move(onFault));
}

std::optional<Bytes> CaptureReader::next(bool mayGrow)
{
    _mayGrow = mayGrow;
    _window.skip(std::exchange(_given, 0));
    while (!_hasStopped && !_window.peek(1).empty()) {
        Found found = find();
        if (found.gap) {
            reportSkipped();
            _missing += *found.gap;
            _window.skip(found.size);
            continue;
        }
        if (found.size != 0)
            return take(found.size, found.reason);
        if (found.incomplete && mayGrow)
            return std::nullopt;
        if (!_skipping)
            _skipping = CaptureFault{_window.offset(), 0, std::move(found.reason)};
        if (_onDamage == OnDamage::Stop) {
            _hasStopped = true;
            break;
        }
        _window.skip(1);
        ++_skipping->size;
    }
    if (!mayGrow || _hasStopped)
        reportSkipped();
    return std::nullopt;
}

CaptureReader::Found CaptureReader::find()
{
    if (_onDamage == OnDamage::Stop)
        return byLength();
    return _skipping ? behindDamage() : inOrder();
}

Bytes CaptureReader::take(std::size_t size, const std::string& flaw)
{
    reportSkipped();
    if (!flaw.empty())
        _onFault({_window.offset(), 0, flaw});
    _given = size;
    return message(size);
}

void CaptureReader::reportSkipped()
{
    if (_skipping)
        _onFault(*std::exchange(_skipping, std::nullopt));
}

} // namespace kestrum
