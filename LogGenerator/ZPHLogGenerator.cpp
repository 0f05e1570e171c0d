#include "LogGenerator/ZPHLogGenerator.h"

#include "LogGenerator/DlfVersionReport.h"
#include "platform/Bundle.h"
#include "platform/Clock.h"
#include "platform/SystemLog.h"
#include "support/Format.h"

#include <utility>

namespace kestrum {
namespace {

/// The time of compilation: "Aug  1 2017 22:02:27".
constexpr std::string_view kBuildText = __DATE__ " " __TIME__;

std::uint64_t packedTime(Date now, Clock::Zone zone)
{
    const auto seconds = std::chrono::floor<std::chrono::seconds>(now).time_since_epoch().count();
    const auto minutes = static_cast<std::int16_t>(zone.offset / std::chrono::minutes(1));
    return packDlfTime(static_cast<std::uint32_t>(seconds), minutes, zone.daylightSaving);
}

} // namespace

void ZPHLogGenerator::moveBinDataToState(State& state)
{
    auto interval = binData.take();
    if (interval.dropped > 0)
        _roles.log.write(Priority::Warning, "Too many raw records for one interval: the oldest %lu were dropped",
                         interval.dropped);
    state.set(StateKey::kDisplayState, Data(std::move(interval.bytes)));
}

std::optional<Data> ZPHLogGenerator::generateDlfFromState(const State& state) const
{
    std::vector<std::byte> stream(kDlfVersionReportSize);
    const auto versionText = formatted("Kestrum %@", _roles.bundle.version().value_or("(none)"));
    const Date now = _roles.clock.now();
    std::uint32_t written = 0;
    const int result =
        QrelDLFAddVersionReport(stream.data(), static_cast<std::uint32_t>(stream.size()), written, 1, 1, versionText,
                                "EXECUTABLE_NAME", kBuildText, packedTime(now, _roles.clock.zoneAt(now)));
    if (result != 0) {
        _roles.log.write(Priority::Raw16, "Could not write DLF header (result=%d)", result);
        return std::nullopt;
    }
    if (const auto history = state.at(StateKey::kHistory).array()) {
        for (const auto& entry : *history) {
            const auto dictionary = entry.dictionary();
            const Value recorded = dictionary ? dictionary->at(StateKey::kDisplayState) : Value();
            if (recorded.isNull())
                continue;
            if (recorded.data() == nullptr) {
                _roles.log.write(Priority::Raw16,
                                 "Got wrong class writing history to DLF; aborting writing the DLF file");
                return std::nullopt;
            }
            // Without the type byte of the interval's first record. The other records keep theirs.
            const Bytes raw = recorded.data()->bytes();
            if (!raw.empty())
                stream.insert(stream.end(), raw.begin() + 1, raw.end());
        }
    }
    return Data(std::move(stream));
}

ArrayRef ZPHLogGenerator::getSaveContentsFromState(const State& state) const
{
    const auto history = state.at(StateKey::kHistory).array();
    auto contents = history ? std::make_shared<Array>(*history) : makeArray();
    if (const auto dlf = generateDlfFromState(state))
        contents->append(makeDictionary(
            {{"Description", formatted("DLF binary (%d bytes)", static_cast<int>(dlf->size()))}, {"DLF", *dlf}}));
    return contents;
}

} // namespace kestrum
