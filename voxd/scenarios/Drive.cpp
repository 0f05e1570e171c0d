#include "voxd/scenarios/Drive.h"

namespace kestrum {
namespace {

constexpr unsigned kLegTicks = 30 * Modem::kSecond;
constexpr double kPrefixed = 0.02; // share of the records that have a prefix

} // namespace

void ModemLog::add(LogCode code, const Value& propertyList)
{
    if (const auto serialised = _lists.toXml(propertyList))
        _records.emplace_back(code, serialised->bytes());
}

Drive::Drive(const ScenarioSetting& setting, std::initializer_list<MakeModem> modems)
    : _start(setting.start), _random(setting.seed), _world(Random(_random.bits())), _log(setting.lists)
{
    for (const auto make : modems)
        _modems.push_back(make(_world, Random(_random.bits())));
    modem().begin(_log);
}

std::optional<Source::Message> Drive::next()
{
    while (_ready.empty())
        tick();
    auto message = std::move(_ready.front());
    _ready.pop_front();
    return message;
}

void Drive::tick()
{
    if (_ticks > 0 && _ticks % Modem::kMove == 0) {
        _world.drive(Modem::kMoveSeconds);
        if (_modems.size() > 1 && _ticks % kLegTicks == 0) {
            ++_leg;
            modem().begin(_log);
        } else {
            modem().move(_log);
        }
    }
    modem().tick(_log, _ticks);

    // The records of a tick are spread evenly over the tick.
    auto records = _log.take();
    const auto began = Modem::kTick * _ticks;
    for (std::size_t i = 0; i < records.size(); ++i) {
        const std::chrono::microseconds at = began + std::chrono::microseconds(Modem::kTick) * i / records.size();
        _ready.push_back({at, std::move(records[i]).message(_start + at, _random.chance(kPrefixed))});
    }
    ++_ticks;
}

} // namespace kestrum
