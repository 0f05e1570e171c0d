#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Identity and access restrictions of the serving cell: log code 0xD0E2 and the telephony service's cell monitor.
class UTRANServingCellInfo final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;
};

} // namespace kestrum
