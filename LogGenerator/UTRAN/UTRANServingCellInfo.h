#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Identity and access restrictions of the serving cell: log code 0xD0E2 and the telephony service's cell monitor.
class UTRANServingCellInfo final : public Base {
public:
    explicit UTRANServingCellInfo(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
