#pragma once

#include "insight/RowOfPane.h"
#include "insight/SheetSource.h"

#include <string>
#include <string_view>

namespace kestrum {

class Thresholds;

/// What the key of a row means, what follows from its value, and how good the value is. Of a row that opens a pane:
/// what is in it.
class MeaningSheet final : public SheetSource {
public:
    /// The thresholds outlive it.
    MeaningSheet(const Shown& shown, RowOfPane row, const Thresholds& thresholds);

    /// When the row has gone, what was shown last stays.
    bool update(const Shown& shown) override;

private:
    SheetPart meaningOf(std::string_view technology, const KestrumModelNode& pane, const KestrumModelNode& row) const;

    RowOfPane _row;
    const Thresholds& _thresholds;
};

} // namespace kestrum
