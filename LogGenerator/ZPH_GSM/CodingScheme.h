#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// A place in the display that no record fills.
class CodingScheme final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    // The word of another section, on purpose.
    std::string_view entryLine() const override { return "CellChangeCounters"; }
};

} // namespace kestrum
