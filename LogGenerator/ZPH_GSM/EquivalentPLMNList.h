#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The networks that count as the serving one (3GPP TS 24.008), one row each: log code 0x7150.
class EquivalentPLMNList final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;
};

} // namespace kestrum
