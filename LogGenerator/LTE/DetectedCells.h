#pragma once

#include "LogGenerator/Base.h"

namespace kestrum {

/// The cells found, but not measured, in connected mode, one row a cell: log code 0xB179.
class DetectedCells final : public Base {
public:
    explicit DetectedCells(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;
};

} // namespace kestrum
