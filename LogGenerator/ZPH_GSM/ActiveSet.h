#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The cells of the UMTS active set (3GPP TS 25.331), one row each: log code 0x417A.
class ActiveSet final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "ActiveSet"; }
};

} // namespace kestrum
