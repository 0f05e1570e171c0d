#pragma once

#include "doubles/MonitorDoubles.h"
#include "platform/TelephonyService.h"

#include <chrono>
#include <optional>
#include <string_view>

namespace kestrum {

/// The telephony service and its IFX modem, on the doubles of the monitor: the test brings them up and down.
class ServedModem {
public:
    static constexpr const char* kCommands = "vox.commands";

    /// `lists` are those of the application's roles.
    ServedModem(MonitorDoubles& doubles, PropertyLists& lists) : _doubles(doubles), _lists(lists) {}

    void serve(std::string_view technology = kVoxLogChannelTechnology_IFX)
    {
        const auto reply = wired(makeDictionary({{"GetTechnology", technology}}));
        _doubles.ports.serve(kCommands, [reply](const MemoryPorts::Request& request) {
            const bool asked = request.reply == RemotePort::Reply::Awaited;
            return MemoryPorts::Answer{0, asked ? std::optional(reply) : std::nullopt};
        });
    }
    void kill() { _doubles.ports.kill(kCommands); }

    /// A message that holds the whole display. False when nothing listens.
    bool send(const Value& display)
    {
        return _doubles.ports.send(std::string(kLogChannelServiceName), 0, textOf(wired(display).bytes()));
    }
    /// The same, and the refresh that finds it.
    bool show(const Value& display)
    {
        using namespace std::chrono_literals;
        const bool sent = send(display);
        _doubles.queue.advance(2s);
        return sent;
    }

    /// Two entries at least, so that the modem's wrapper dictionaries do not matter.
    static Value cell(const char* rssi)
    {
        return makeDictionary({{"RSSI", rssi}, {"Band", makeDictionary({{"Now", "3"}, {"Before", "8"}})}});
    }

private:
    Data wired(const Value& list)
    {
        _doubles.propertyLists.parsed[describe(list)] = list; // where they are doubled
        return _lists.toXml(list).value();
    }

    MonitorDoubles& _doubles;
    PropertyLists& _lists;
};

/// What Save needs: the marker of an internal installation.
inline constexpr const char* kInternalInstall = "/NorvaneInternal/Library/PreferenceBundles/Carrier Settings.bundle";

} // namespace kestrum
