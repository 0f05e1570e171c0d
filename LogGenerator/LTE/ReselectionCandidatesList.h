#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The cells of any radio access technology that reselection (3GPP TS 36.304) considers, one row a cell: log code 0xB186.
class ReselectionCandidatesList final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;
};

} // namespace kestrum
