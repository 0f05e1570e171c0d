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
constexpr std::string_view kModeNames[] = {
    "Disconnected", "Connecting", "Cell Fach", "Cell DCH", "Cell PCH", "Cell URA PCH",
};

std::uint32_t modeOf(Record data)
{
    return data.read(kValidity) == kValid ? data.read(kMode).value_or(kNoMode) : kNoMode;
}

} // namespace

std::string_view RRC_State::getSectionName() const
{
    return "RRC Info";
}

std::vector<LogCode> RRC_State::getLogCodeArray() const
{
    return {0xD0E0};
}

void RRC_State::updateWithData(Record data, LogCode logCode)
{
    logEntry();
    if (logCode != 0xD0E0)
        return;
    // A short record is decoded all the same, on purpose: without a mode it says that the mode is not known.
    if (data.size() < kExpectedLength)
        roles.log.write(Priority::Warning, "LogCode_0xD0E0 is length is %ld expected size %ld",
                        static_cast<long>(data.size()), static_cast<long>(kExpectedLength));
    const std::uint32_t mode = modeOf(data);
    const std::string_view name = mode < std::size(kModeNames) ? kModeNames[mode] : "Unknown RRC Mode";
    publish("State", name);
    if (roles.console.isDebugWatched())
        roles.console.debug(formatted("Display Dict = %@, rrc mode = %d %@", describe(sectionRef.node()),
                                      static_cast<std::int32_t>(mode), name));
}

} // namespace kestrum
