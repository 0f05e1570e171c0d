#include "ui/ConnectionHint.h"

namespace kestrum {

std::string connectionHint(const std::optional<Problem>& problem)
{
    std::string text = "Waiting for the telephony service.\n";
    if (problem)
        text.append(problem->text).append("\n");
    return text + "To start a simulated one:\nvoxd --scenario lte";
}

} // namespace kestrum
