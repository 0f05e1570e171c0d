#include "LogGenerator/LTE/ReselectionCandidatesList.h"

namespace kestrum {
namespace {

constexpr std::size_t kMinimumLength = 21;

// Of the 16-bit count only the low byte counts.
constexpr Field kCount = u8(19);
// Candidates stand 4 bytes apart though each is longer: a payload lies over the next header. The modem packs them so; a
// wider stride would misread the second candidate.
constexpr std::size_t kFirst = 21, kStride = 4;

constexpr Row kPriority[] = {{u16(0), "Candidate Priority", decimal}};
constexpr Field kRatType = u16(2);
constexpr std::size_t kHeaderSize = 4;

// The payloads, from the candidate's first byte.
// clang-format off
constexpr Row kLte[] = {
    {u16(4),             "E ARFCN", decimal},
    {u16(6).bits(7, 15), "Cell ID", decimal},
};
constexpr Row kUtran[] = {
    {u16(4), "U ARFCN", decimal},
    {u16(6), "PSC",     decimal},
};
constexpr Row kGeran[] = {
    {u16(4), "ARFCN",   decimal},
    {u8(6),  "Band",    decimal},
    {u8(7),  "BSIC ID", decimal},
};
constexpr Row kCdma[] = {
    {u8(4),   "Band",    decimal},
    {u16(8),  "Channel", decimal},
    {u16(10), "Pilot",   decimal},
};

constexpr struct Rat {
    std::string_view name;
    std::span<const Row> payload;
} kRats[] = {
    {"LTE",       kLte},
    {"UTRAN",     kUtran},
    {"GERAN",     kGeran},
    {"CDMA1XRTT", kCdma},
    {"CDMAHRPD",  kCdma},
};
// clang-format on
constexpr Rat kUnknownRat{"??", {}};

/// Appends the row of the candidate that begins with these bytes; false unless all of its fields are there.
bool appendCandidate(Array& list, Record candidate)
{
    const auto type = candidate.read(kRatType);
    if (!type)
        return false;
    const Rat& rat = *type < std::size(kRats) ? kRats[*type] : kUnknownRat;
    if (candidate.size() < std::max(kHeaderSize, reach(rat.payload)))
        return false;
    Dictionary& row = list.appendRow();
    show(candidate, kPriority, row);
    row.setText("Candidate RAT Type", rat.name);
    show(candidate, rat.payload, row);
    return true;
}

} // namespace

std::string_view ReselectionCandidatesList::getSectionName() const
{
    return "Reselection Candidates List";
}

std::vector<LogCode> ReselectionCandidatesList::getLogCodeArray() const
{
    return {0xB186};
}

void ReselectionCandidatesList::updateWithData(Record data, LogCode logCode)
{
    if (!accepts(data, logCode, 0xB186, kMinimumLength))
        return;
    clearElementsInArray(sectionRef);
    const std::size_t count = data.read(kCount).value_or(0);
    replaceArray(sectionRef, [&](Array& list) {
        for (std::size_t i = 0; i < count; ++i) {
            const auto rest = data.from(kFirst + kStride * i);
            if (!rest || !appendCandidate(list, *rest))
                break; // the count may promise more candidates than the record holds
        }
    });
}

} // namespace kestrum
