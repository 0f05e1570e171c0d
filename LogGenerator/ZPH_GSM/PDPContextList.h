#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The PDP contexts (3GPP TS 24.008), one row each as the telephony service sends it. Other technologies show the same
/// section.
class PDPContextList final : public Base {
public:
    explicit PDPContextList(DecodingRoles& decodingRoles);

private:
    /// Does not look at the code: a record of any code is taken for one of PDP contexts.
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
