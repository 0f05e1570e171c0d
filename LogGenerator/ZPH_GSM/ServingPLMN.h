#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Network, location area and service: log codes 0x7132 and 0x7135, and the telephony service's cell monitor.
/// The network's codes are three characters from a record and plain numbers from the cell monitor.
class ServingPLMN final : public Base {
public:
    explicit ServingPLMN(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
