#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The GSM cells ranked for reselection, one row each: log code 0x4005.
class GSMSet final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "GSMSet"; }
};

} // namespace kestrum
