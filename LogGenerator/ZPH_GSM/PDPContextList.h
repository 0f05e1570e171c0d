#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The PDP contexts (3GPP TS 24.008), one row each, as the telephony service sends them. LTE and UTRAN have this
/// section too.
class PDPContextList final : public Base {
public:
    explicit PDPContextList(DecodingRoles& decodingRoles);

private:
    /// Ignores the code: decodes every record as one of PDP contexts.
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
