#include "capture/CaptureFormat.h"

#include "support/Record.h"

namespace kestrum {

std::optional<CaptureFormat> captureFormat(std::string_view path)
{
    if (path.ends_with(".kcap"))
        return CaptureFormat::Kcap;
    if (path.ends_with(".dlf"))
        return CaptureFormat::Dlf;
    return std::nullopt;
}

CaptureFormat captureFormatFromBytes(Bytes begin)
{
    const auto length = Record(begin).read(u32(0)).value_or(0);
    return length <= kLongestMessage ? CaptureFormat::Kcap : CaptureFormat::Dlf;
}

} // namespace kestrum
