#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// HARQ processes of HSDPA (3GPP TS 25.321): log code 0x4221.
class HSDPAInformation final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;
};

} // namespace kestrum
