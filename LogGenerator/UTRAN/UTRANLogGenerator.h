#pragma once

#include "LogGenerator/ZPHLogGenerator2.h"

namespace kestrum {

/// UTRAN (TD-SCDMA and W-CDMA measurements) from binary records. Its template is the first property-list resource whose
/// file name contains "UTRAN" in upper or lower case. Without a template its functions do nothing.
class UTRANLogGenerator final : public ZPHLogGenerator2 {
public:
    static std::unique_ptr<UTRANLogGenerator> generator(DecodingRoles& roles);

    std::string_view technology() const override;

private:
    UTRANLogGenerator(DecodingRoles& roles, std::string templateName);
    UTRANLogGenerator(DecodingRoles& roles, Uninitialized uninitialized);
};

} // namespace kestrum
