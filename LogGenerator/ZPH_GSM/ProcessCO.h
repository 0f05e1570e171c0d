#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// Circuit-switched mobility management and registration in brief: log codes 0x7131 and 0x7132.
class ProcessCO final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    // The word of another section, on purpose.
    std::string_view entryLine() const override { return "ProcessCS"; }
};

} // namespace kestrum
