#pragma once

#include "LogGenerator/Base.h"

#include <vector>

namespace kestrum {

/// The GSM neighbours, one row each: from the modem (log code 0x5137, with the colour codes of the last 0x51FF), or
/// from the telephony service's cell monitor.
class NeighboringCells final : public Base {
public:
    explicit NeighboringCells(DecodingRoles& decodingRoles);

private:
    void decode(Record data, const Layout& layout) override;

    void learnColourCodes(Record data);
    void listMeasurements(Record data) const;

    struct ColourCode {
        std::uint32_t arfcn, bsic;
    };
    std::vector<ColourCode> arfcnToBsic; ///< at most 255; a map would allocate for each record
};

} // namespace kestrum
