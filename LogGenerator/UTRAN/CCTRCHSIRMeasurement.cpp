#include "LogGenerator/UTRAN/CCTRCHSIRMeasurement.h"

namespace kestrum {
namespace {

constexpr Field kTransportChannels = u16(14).bits(6, 11);
constexpr Field kCount = u16(14).bits(12, 15);

/// The entries follow the transport channels' blocks of 34 bytes each.
constexpr Elements entries(std::size_t transportChannels)
{
    return {289 + 34 * transportChannels, 8};
}

// clang-format off
constexpr Row kEntry[] = {
    {u8(0), "CCTRCH ID", decimalSigned32},
    {u8(1), "TSNUM",     decimalSigned32},
};
// clang-format on
constexpr Elements kSirs{2, 1};
constexpr std::size_t kSirCount = 6;
static_assert(kSirs.first + kSirs.stride * kSirCount == entries(0).length);

void showEntry(Record entry, Dictionary& row)
{
    show(entry, kEntry, row);
    listed(entry, kSirs, kSirCount, u8(0), decimalSigned32)(row.slot("SIR").becomeArray());
}

constexpr Layout kLayouts[] = {
    {.code = 0xD00C, .minimumLength = 17},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "CCTRCH SIR",
    .layouts = kLayouts,
    .entryLine = "CCTRCH SIR Measurement",
    .foreignCode = ForeignCode::Ignored,
};

} // namespace

CCTRCHSIRMeasurement::CCTRCHSIRMeasurement(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void CCTRCHSIRMeasurement::decode(Record data, const Layout&)
{
    const auto channels = data.read(kTransportChannels).value_or(0);
    replaceArray(sectionRef, listed(data, entries(channels), data.read(kCount).value_or(0), showEntry));
}

} // namespace kestrum
