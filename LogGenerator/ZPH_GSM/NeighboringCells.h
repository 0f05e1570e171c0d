#pragma once

#include "LogGenerator/Base.h"

#include <unordered_map>

namespace kestrum {

/// The GSM neighbours, one row each: from the modem (log code 0x5137, with the colour codes of the last 0x51FF), or
/// from the telephony service's cell monitor.
class NeighboringCells final : public Base {
public:
    using Base::Base;

    std::string_view getSectionName() const override;
    std::vector<LogCode> getLogCodeArray() const override;
    void updateWithData(Record data, LogCode logCode) override;

protected:
    std::string_view entryLine() const override { return "NeighboringCells"; }

private:
    void learnColourCodes(Record data);
    void listMeasurements(Record data) const;

    std::unordered_map<std::uint32_t, std::uint32_t> arfcnToBsic;
};

} // namespace kestrum
