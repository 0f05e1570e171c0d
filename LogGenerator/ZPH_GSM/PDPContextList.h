#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The PDP contexts (3GPP TS 24.008), one row each as the telephony service sends it. Other technologies show the same
/// section.
class PDPContextList final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    /// Does not look at the code: a record of any code is taken for one of PDP contexts.
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "PDPContextList"; }
};

} // namespace kestrum
