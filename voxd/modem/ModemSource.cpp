#include "voxd/modem/ModemSource.h"

#include "platform/Clock.h"
#include "platform/PropertyLists.h"
#include "platform/TelephonyService.h"
#include "voxd/modem/ModemManager.h"

#include <utility>

namespace kestrum {
namespace {

// The display gets a tree at least this often, so that its time goes on.
constexpr std::chrono::milliseconds kPulse{2000};
// One event of the modem changes several properties. However fast they change, ten trees a second are enough.
constexpr std::chrono::milliseconds kSettling{100};

} // namespace

ModemSource::ModemSource(ModemManager& modems, ModemTreeSetting setting, MainQueue& queue, const Clock& clock,
                         PropertyLists& lists)
    : _modems(modems), _setting(std::move(setting)), _queue(queue), _clock(clock), _lists(lists)
{
    _modems.changed = [this] { noteChange(); };
}

ModemSource::~ModemSource()
{
    _modems.changed = [] {};
}

std::string_view ModemSource::technology() const
{
    return kVoxLogChannelTechnology_IFX;
}

std::optional<Source::Message> ModemSource::next()
{
    if (!std::exchange(_due, false))
        return std::nullopt;
    const auto list = _lists.toXml(Value(makeModemTree(_modems.states(), _clock.now(), _setting)));
    if (!list)
        return std::nullopt;
    const auto bytes = list->bytes();
    return Message{.bytes = {bytes.begin(), bytes.end()}};
}

void ModemSource::streamedTo(std::size_t clients)
{
    _due = _due || clients > _clients;
    _clients = clients;
    if (clients == 0) {
        _pulse.reset();
        _settling.reset();
    } else if (!_pulse) {
        _pulse = _queue.repeat(kPulse, [this] { offer(); });
    }
    _modems.setMeasuring(clients > 0);
}

void ModemSource::noteChange()
{
    if (_clients > 0 && !_settling)
        _settling = _queue.repeat(kSettling, [this] {
            _settling.reset();
            offer();
        });
}

void ModemSource::offer()
{
    _due = true;
    available();
}

} // namespace kestrum
