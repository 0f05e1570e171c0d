#include "LogGenerator/LTE/ReselectionCandidatesList.h"

namespace kestrum {
namespace {

// The count has 16 bits; only the low byte is used.
constexpr Field kCount = u8(19);
// Candidates begin 4 bytes apart although each is longer: a payload overlaps the next header. The modem packs them so;
// a larger stride would misread the second candidate.
constexpr std::size_t kFirst = 21, kStride = 4;

constexpr Row kPriority[] = {{u16(0), "Candidate Priority", decimalSigned32}};
constexpr Field kRatType = u16(2);
constexpr std::size_t kHeaderSize = 4;

// The payloads; offsets from the candidate's first byte.
// clang-format off
constexpr Row kLte[] = {
    {u16(4),             "E ARFCN", decimalSigned32},
    {u16(6).bits(7, 15), "Cell ID", decimalSigned32},
};
constexpr Row kUtran[] = {
    {u16(4), "U ARFCN", decimalSigned32},
    {u16(6), "PSC",     decimalSigned32},
};
constexpr Row kGeran[] = {
    {u16(4), "ARFCN",   decimalSigned32},
    {u8(6),  "Band",    decimalSigned32},
    {u8(7),  "BSIC ID", decimalSigned32},
};
constexpr Row kCdma[] = {
    {u8(4),   "Band",    decimalSigned32},
    {u16(8),  "Channel", decimalSigned32},
    {u16(10), "Pilot",   decimalSigned32},
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

const Rat& ratOf(std::uint32_t type)
{
    return type < std::size(kRats) ? kRats[type] : kUnknownRat;
}

std::string_view ratName(std::uint32_t type)
{
    return ratOf(type).name;
}

/// Appends the row of the candidate that begins with these bytes; false unless all of its fields are there.
bool appendCandidate(Array& list, Record candidate)
{
    const auto type = candidate.read(kRatType);
    if (!type)
        return false;
    const Rat& rat = ratOf(*type);
    if (candidate.size() < std::max(kHeaderSize, reach(rat.payload)))
        return false;
    Dictionary& row = list.appendRow();
    show(candidate, kPriority, row);
    row.set("Candidate RAT Type", Reading(named<ratName>, *type));
    show(candidate, rat.payload, row);
    return true;
}

constexpr Layout kLayouts[] = {
    {.code = 0xB186, .minimumLength = 21},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "Reselection Candidates List",
    .layouts = kLayouts,
};

} // namespace

ReselectionCandidatesList::ReselectionCandidatesList(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void ReselectionCandidatesList::decode(Record data, const Layout&)
{
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
