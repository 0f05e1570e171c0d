#include "LogGenerator/ParsedOnce.h"

namespace kestrum {

Value ParsedOnce::parse(Bytes bytes) const
{
    if (textOf(bytes) != textOf(_bytes)) {
        _value = _lists.parse(bytes);
        _bytes.assign(bytes.begin(), bytes.end());
    }
    return _value;
}

} // namespace kestrum
