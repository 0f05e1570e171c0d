#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The serving cell from which reselection (3GPP TS 36.304) is considered: log code 0xB186.
class ReselectionCandidatesMisc final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;
};

} // namespace kestrum
