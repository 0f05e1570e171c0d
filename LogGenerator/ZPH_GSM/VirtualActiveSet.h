#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The UMTS virtual active set. Log code 0x417A empties it; nothing fills it.
class VirtualActiveSet final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "VirtualActiveSet"; }
};

} // namespace kestrum
