#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The cells found, but not measured, in connected mode, one row a cell: log code 0xB179.
class DetectedCells final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;
};

} // namespace kestrum
