#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Block errors of the UMTS transport channels: log code 0x4116.
class BLER final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;
};

} // namespace kestrum
