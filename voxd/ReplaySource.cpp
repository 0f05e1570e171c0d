#include "voxd/ReplaySource.h"

#include "capture/MessageTime.h"
#include "capture/Technology.h"
#include "support/Format.h"

#include <stdexcept>

namespace kestrum {
namespace {

CaptureFormat formatOf(const std::string& path)
{
    if (const auto format = captureFormat(path))
        return *format;
    throw std::runtime_error(path + ": neither .kcap nor .dlf");
}

} // namespace

ReplaySource::ReplaySource(const std::string& path, bool loop, PropertyLists& lists)
    : _lists(lists), _path(path), _format(formatOf(path)), _file(path, std::ios::binary), _loop(loop)
{
    // A directory can be opened but not read.
    if (!_file || (_file.peek(), _file.bad()))
        throw std::runtime_error(path + ": cannot be read");
    rewind();
    bool empty = true;
    while (_technology.empty()) {
        const auto message = _reader->next();
        if (!message)
            break;
        empty = false;
        _technology = technologyOf(*message).value_or(std::string_view());
    }
    if (_technology.empty() && !_fault.empty())
        throw std::runtime_error(_fault);
    if (_technology.empty())
        throw std::runtime_error(path +
                                 (empty ? ": contains no message" : ": its messages do not show the technology"));
    rewind();
}

std::optional<Source::Message> ReplaySource::next()
{
    auto message = _reader->next();
    if (!message && _loop && _last && _fault.empty()) {
        rewind();
        message = _reader->next();
    }
    if (!message)
        return std::nullopt;
    _technology = technologyOf(*message).value_or(_technology);
    _last = _last.value_or(std::chrono::microseconds(0)) + gapBefore(*message);
    return Message{*_last, {message->begin(), message->end()}};
}

void ReplaySource::rewind()
{
    _file.clear();
    _file.seekg(0);
    _window = std::make_unique<ByteWindow>(_file);
    _fault.clear();
    _reader = CaptureReader::make(_format, *_window, OnDamage::Stop, [this](const CaptureFault& fault) {
        _fault = formatted("%s: at offset %lu: %s", _path, fault.offset, fault.reason);
    });
    _lastTime.reset();
}

std::chrono::microseconds ReplaySource::gapBefore(Bytes message)
{
    const auto time = timeOf(message, _lists);
    const auto before = time ? std::exchange(_lastTime, time) : std::nullopt;
    if (!_last)
        return std::chrono::microseconds(0);
    if (!before)
        return kNominalSpacing;
    const auto gap = *time - *before;
    return gap < gap.zero() || gap > kLongestGap ? gap.zero() : gap;
}

} // namespace kestrum
