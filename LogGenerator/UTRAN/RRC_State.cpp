#include "LogGenerator/UTRAN/RRC_State.h"

#include "platform/Console.h"
#include "platform/SystemLog.h"

namespace kestrum {
namespace {

constexpr std::size_t kExpectedLength = 15;
constexpr Field kValidity = u8(13);
constexpr Field kMode = u8(14);

constexpr std::uint32_t kValid = 1;
constexpr std::uint32_t kNoMode = 255;

std::string_view modeName(std::uint32_t mode)
{
    static constexpr std::string_view kNames[] = {
        "Disconnected", "Connecting", "Cell Fach", "Cell DCH", "Cell PCH", "Cell URA PCH",
    };
    return mode < std::size(kNames) ? kNames[mode] : "Unknown RRC Mode";
}

std::uint32_t modeOf(Record data)
{
    return data.read(kValidity) == kValid ? data.read(kMode).value_or(kNoMode) : kNoMode;
}

constexpr Layout kLayouts[] = {
    {.code = 0xD0E0},
};
static_assert(fits(kLayouts));

constexpr SectionTraits kTraits{
    .name = "RRC Info",
    .layouts = kLayouts,
    .foreignCode = ForeignCode::Ignored,
};

} // namespace

RRC_State::RRC_State(DecodingRoles& decodingRoles) : Base(decodingRoles, kTraits) {}

void RRC_State::decode(Record data, const Layout&)
{
    // Kept: a short record is decoded too. Without the mode field it shows an unknown mode.
    if (data.size() < kExpectedLength)
        roles.log.write(Priority::Warning, "LogCode_0xD0E0 is length is %ld expected size %ld",
                        static_cast<long>(data.size()), static_cast<long>(kExpectedLength));
    const std::uint32_t mode = modeOf(data);
    publish("State", Reading(named<modeName>, mode));
    if (roles.console.isDebugWatched())
        roles.console.debug(formatted("Display Dict = %@, rrc mode = %d %@", describe(sectionRef.node()),
                                      static_cast<std::int32_t>(mode), modeName(mode)));
}

} // namespace kestrum
