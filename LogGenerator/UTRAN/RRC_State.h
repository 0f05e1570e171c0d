#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Mode of the radio resource control (3GPP TS 25.331): log code 0xD0E0.
class RRC_State final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;
};

} // namespace kestrum
