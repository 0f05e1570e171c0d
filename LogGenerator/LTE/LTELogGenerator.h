#pragma once

#include "LogGenerator/ZPHLogGenerator2.h"

namespace kestrum {

/// LTE (3GPP E-UTRA) from binary records; template "LTE".
class LTELogGenerator final : public ZPHLogGenerator2 {
public:
    static std::unique_ptr<LTELogGenerator> generator(DecodingRoles& roles);
    ~LTELogGenerator() override;

    std::string_view technology() const override;

private:
    explicit LTELogGenerator(DecodingRoles& roles);
};

} // namespace kestrum
