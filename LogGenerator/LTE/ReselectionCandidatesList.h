#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The cells of any radio access technology that reselection (3GPP TS 36.304) considers, one row a cell: log code 0xB186.
class ReselectionCandidatesList final : public Base {
public:
    explicit ReselectionCandidatesList(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
