#include "insight/keys/Channels.h"

namespace kestrum {

std::optional<double> frequencyOfNrArfcn(std::int64_t number)
{
    // Frequencies in kHz.
    struct Range {
        std::int64_t first, last;
        double lowest, step;
    };
    constexpr Range kRanges[] = {
        {0, 599999, 0, 5},
        {600000, 2016666, 3000000, 15},
        {2016667, 3279165, 24250080, 60},
    };
    for (const auto& [first, last, lowest, step] : kRanges)
        if (first <= number && number <= last)
            return (lowest + step * static_cast<double>(number - first)) / 1000;
    return std::nullopt;
}

} // namespace kestrum
