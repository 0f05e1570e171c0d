#include "support/Reading.h"

#include <cmath>

namespace kestrum {

std::optional<double> Reading::number() const
{
    if (_quantity->number == nullptr)
        return std::nullopt;
    const double number = _quantity->number(_raw);
    return std::isfinite(number) ? std::optional(number) : std::nullopt;
}

} // namespace kestrum
