#include "insight/Thresholds.h"

namespace kestrum {

std::string_view word(Grade grade)
{
    switch (grade) {
    case Grade::NoService:
        return "no service";
    case Grade::Poor:
        return "poor";
    case Grade::Fair:
        return "fair";
    case Grade::Good:
        return "good";
    case Grade::Excellent:
        return "excellent";
    }
    return "";
}

} // namespace kestrum
