#include "LogGenerator/ParsedOnce.h"

#include <utility>

namespace kestrum {

Value ParsedOnce::parse(Bytes bytes)
{
    if (textOf(bytes) != textOf(_bytes)) {
        _value = _lists.parseOver(bytes, std::exchange(_value, {}));
        _bytes.assign(bytes.begin(), bytes.end());
    }
    return _value;
}

} // namespace kestrum
