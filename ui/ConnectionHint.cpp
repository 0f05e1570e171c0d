#include "ui/ConnectionHint.h"

namespace kestrum {

std::string connectionHint(std::string_view reason)
{
    std::string text = "Waiting for the telephony service.\n";
    if (!reason.empty())
        text.append(reason).append("\n");
    return text + "To start a simulated one:\nvoxd --scenario lte";
}

} // namespace kestrum
