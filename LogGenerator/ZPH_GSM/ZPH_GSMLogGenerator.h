#pragma once

#include "LogGenerator/ZPHLogGenerator2.h"

namespace kestrum {

/// GSM, GPRS and UMTS (3GPP) from binary records: 26 sections; template "ZPH_GSM".
class ZPH_GSMLogGenerator final : public ZPHLogGenerator2 {
public:
    static std::unique_ptr<ZPH_GSMLogGenerator> generator(DecodingRoles& roles);
    ~ZPH_GSMLogGenerator() override;

    std::string_view technology() const override;

private:
    explicit ZPH_GSMLogGenerator(DecodingRoles& roles);
};

} // namespace kestrum
