#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The UMTS monitored set. Log code 0x417A empties it; nothing fills it.
class MonitoredSet final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "MonitoredSet"; }
};

} // namespace kestrum
