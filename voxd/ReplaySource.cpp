#include "voxd/ReplaySource.h"

#include "platform/ChannelMessage.h"
#include "support/Date.h"
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

ReplaySource::ReplaySource(const std::string& path, bool loop, std::string_view technology)
    : _path(path), _file(path, std::ios::binary), _reader(_file, formatOf(path)), _loop(loop), _technology(technology)
{
    // A directory opens, but cannot be read.
    if (!_file || (_file.peek(), _file.bad()))
        throw std::runtime_error(path + ": cannot be read");
    bool empty = true;
    while (_technology.empty()) {
        const auto message = _reader.next();
        if (!message)
            break;
        empty = false;
        _technology = technologyOf(*message).value_or(std::string_view());
    }
    if (_technology.empty() && !fault().empty())
        throw std::runtime_error(fault());
    if (_technology.empty())
        throw std::runtime_error(path + (empty ? ": holds no message" : ": no message tells its technology"));
    rewind();
}

std::optional<Source::Message> ReplaySource::next()
{
    auto message = _reader.next();
    if (!message && _loop && _last && _reader.fault().empty()) {
        rewind();
        message = _reader.next();
    }
    if (!message)
        return std::nullopt;
    _technology = technologyOf(*message).value_or(_technology);
    _last = _last.value_or(std::chrono::microseconds(0)) + gapBefore(*message);
    return Message{*_last, *std::move(message)};
}

std::string ReplaySource::fault() const
{
    if (_reader.fault().empty())
        return {};
    return formatted("%s: at offset %lu: %s", _path, _reader.offset(), _reader.fault());
}

void ReplaySource::rewind()
{
    _file.clear();
    _file.seekg(0);
    _reader = CaptureReader(_file, formatOf(_path));
    _lastStamp.reset();
}

std::chrono::microseconds ReplaySource::gapBefore(Bytes message)
{
    if (!_last) {
        if (const auto record = channelRecord(message); record && record->timeStamp != 0)
            _lastStamp = record->timeStamp;
        return std::chrono::microseconds(0);
    }
    const auto record = channelRecord(message);
    if (!record || record->timeStamp == 0)
        return kNominalSpacing;
    const auto before = std::exchange(_lastStamp, record->timeStamp);
    if (!before)
        return kNominalSpacing;
    const auto gap = dateFromTimeStamp(record->timeStamp) - dateFromTimeStamp(*before);
    return gap < gap.zero() || gap > kLongestGap ? gap.zero() : gap;
}

} // namespace kestrum
