#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The serving cell from which reselection (3GPP TS 36.304) is considered: log code 0xB186.
class ReselectionCandidatesMisc final : public Base {
public:
    explicit ReselectionCandidatesMisc(DecodingRoles& decodingRoles);
};

} // namespace kestrum
