#include "insight/keys/KeyEntry.h"

namespace kestrum {

std::string_view word(Kind kind)
{
    switch (kind) {
    case Kind::Level:
        return "level";
    case Kind::Ratio:
        return "ratio";
    case Kind::Time:
        return "time";
    case Kind::Percentage:
        return "percentage";
    case Kind::Counter:
        return "counter";
    case Kind::Number:
        return "number";
    case Kind::Identity:
        return "identity";
    case Kind::State:
        return "state";
    case Kind::Text:
        return "text";
    }
    return "";
}

} // namespace kestrum
